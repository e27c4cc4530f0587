# SPDX-License-Identifier: MIT
"""What documents and property lists in the tree must keep to, and the checks of a tree."""

import pathlib
import re

LINK = re.compile(r"\[[^\]]*\]\(([^)\s]+)\)")
FENCE = re.compile(r"^\s*(```|~~~)")
ELSEWHERE = re.compile(r"[a-z][a-z0-9+.-]*:|#")
CODE_SPAN = re.compile(r"`([^`\s]+)`")
PLACEHOLDER = re.compile(r"[*…=<$]|WORD|PRESET")
TEST_NAME = re.compile(r"`([A-Z]\w*\.\w+)`")
TEST_MACRO = re.compile(r"\bTEST(?:_F|_P)?\(\s*(\w+),\s*(\w+)\s*\)")
FOLDER_LINE = re.compile(r"^([A-Z][A-Za-z]*)/\s")
SOURCE_SUFFIXES = (".cpp", ".h", ".md", ".py")


def files(root):
    """Yields every file of ours; hidden folders and the build tree hold none."""
    for entry in sorted(root.iterdir()):
        if entry.name.startswith(".") or entry.name == "build":
            continue
        found = sorted(entry.rglob("*")) if entry.is_dir() else [entry]
        yield from (path for path in found if path.is_file() and "__pycache__" not in path.parts)


def prose_and_code(text):
    """Yields the lines of a Markdown text, each with whether it lies in a fenced block."""
    fenced = False
    for line in text.splitlines():
        if FENCE.match(line):
            fenced = not fenced
        else:
            yield line, fenced


def broken_links(root):
    """Every relative link of a Markdown document that leads nowhere, as "document: link"."""
    root = pathlib.Path(root)
    broken = []
    for document in (path for path in files(root) if path.suffix == ".md"):
        prose = (line for line, fenced in prose_and_code(document.read_text("utf-8")) if not fenced)
        for target in (target for line in prose for target in LINK.findall(line)):
            if ELSEWHERE.match(target):
                continue
            if not (document.parent / target.partition("#")[0]).exists():
                broken.append(f"{document.relative_to(root).as_posix()}: {target}")
    return broken


def is_there(root, path):
    """Whether a path, perhaps without its suffix, names a file or a folder of the tree."""
    place = root / path
    return place.exists() or any(place.parent.glob(f"{place.name}.*"))


def unknown_paths(root):
    """Every path in code spans of a Markdown document that begins with a folder of the tree and
    names nothing in it, as "document: path". Spans with a placeholder are passed over."""
    root = pathlib.Path(root)
    folders = existing_folders(root)
    unknown = []
    for document in (path for path in files(root) if path.suffix == ".md"):
        prose = (line for line, fenced in prose_and_code(document.read_text("utf-8")) if not fenced)
        for path in (path for line in prose for path in CODE_SPAN.findall(line)):
            is_ours = "/" in path and path.split("/")[0] in folders
            if is_ours and not PLACEHOLDER.search(path) and not is_there(root, path):
                unknown.append(f"{document.relative_to(root).as_posix()}: {path}")
    return unknown


def unknown_tests(root, document):
    """The tests that a document names, `Suite.Name` in the last cell of a table's row, and that no
    source under Tests/ has."""
    root = pathlib.Path(root)
    sources = (path.read_text("utf-8") for path in sorted((root / "Tests").rglob("*.cpp")))
    known = {".".join(names) for source in sources for names in TEST_MACRO.findall(source)}
    rows = (line for line in (root / document).read_text("utf-8").splitlines() if line[:1] == "|")
    named = [name for row in rows for name in TEST_NAME.findall(row.split("|")[-2])]
    return [name for name in named if name not in known]


def mapped_folders(readme):
    """The folders that a README's map names: fenced lines that begin with "Folder/"."""
    matches = (FOLDER_LINE.match(line) for line, fenced in prose_and_code(readme) if fenced)
    return {match.group(1) for match in matches if match}


def existing_folders(root):
    """The top-level folders that hold a file; ours begin with a capital letter."""
    root = pathlib.Path(root)
    names = {path.relative_to(root).parts[0] for path in files(root) if path.parent != root}
    return {name for name in names if name[0].isupper()}


def lists_with_doctype(root):
    """Every property-list file that carries a DOCTYPE line. Sources may hold such texts as data."""
    root = pathlib.Path(root)
    candidates = (path for path in files(root) if path.suffix not in SOURCE_SUFFIXES)
    contents = ((path, path.read_bytes()) for path in candidates)
    return [
        path.relative_to(root).as_posix()
        for path, content in contents
        if b"<plist" in content and b"<!DOCTYPE" in content
    ]
