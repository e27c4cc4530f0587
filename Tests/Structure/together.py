# SPDX-License-Identifier: MIT
"""Names that sources which may be compiled together give twice. The build compiles a target's sources
several at a time where KESTRO_UNITY or KESTRO_UNITY_TESTS says so; which ones changes with every new
file, so no two sources of a target may give one name to different things, not even where each of
them is alone: in unnamed namespaces and behind `static`."""

import collections
import pathlib
import re

# What takes a source apart. Whatever stands in comments, texts and directives is no declaration.
_SILENT = re.compile(
    r'//[^\n]*|/\*.*?\*/|R"(?P<mark>\w*)\(.*?\)(?P=mark)"|"(?:\\.|[^"\\\n])*"'
    r"|(?<!\w)'(?:\\.|[^'\\\n])+'|^[ \t]*#(?:[^\n]*\\\n)*[^\n]*",
    re.DOTALL | re.MULTILINE)
_NAMESPACE = re.compile(r"(?:inline\s+)?namespace(?:\s+([\w:]+))?\s*$")
_ATTRIBUTE = re.compile(r"\[\[.*?\]\]|alignas\s*\([^)]*\)")
_TEMPLATE = re.compile(r"^template\s*<")
_TYPE = re.compile(r"^(?:class|struct|union|enum(?:\s+(?:class|struct))?)\s+(\w+)\s*(?:final\b.*|:.*)?$",
                   re.DOTALL)
_ALIAS = re.compile(r"^using\s+(\w+)\s*=")
_FUNCTION = re.compile(r"(?<![\w:])(operator\s*\S+?|\w+)\s*(\(.*)$", re.DOTALL)
_VARIABLE = re.compile(r"(?<![\w:.])([A-Za-z_]\w*)\s*(?:\[[^\]]*\]\s*)*$")
_NOT_NAMES = {"if", "for", "while", "switch", "return", "decltype", "noexcept", "requires",
              "static_assert", "sizeof", "alignof", "concept", "friend", "const", "override"}


def _without_angles(text):
    """The text without what stands between angle brackets, arguments of templates that is."""
    kept, depth = [], 0
    for index, character in enumerate(text):
        if character == "<":
            depth += 1
        elif character == ">" and text[index - 1] != "-":
            depth = max(0, depth - 1)
        elif depth == 0:
            kept.append(character)
    return "".join(kept)


def _parameters(text):
    """What stands in the first round brackets: two functions of one name differ by it."""
    depth = 0
    for index, character in enumerate(text):
        depth += (character == "(") - (character == ")")
        if depth == 0:
            return " ".join(text[1:index].split())
    return " ".join(text[1:].split())


def _name_in(statement):
    """The name that a statement of a namespace declares, with its parameters where it is a function;
    None when it declares none."""
    statement = _ATTRIBUTE.sub(" ", statement).strip()
    if _TEMPLATE.match(statement):
        end = depth = 0
        for end, character in enumerate(statement):
            depth += (character == "<") - (character == ">" and statement[end - 1] != "-")
            if depth == 0 and character == ">":
                break
        statement = statement[end + 1:].strip()
        statement = re.sub(r"^requires\b[^\n]*\n", "", statement).strip()
    for pattern in (_TYPE, _ALIAS):
        if match := pattern.match(statement):
            return match.group(1), None
    if re.match(r"^(using|typedef|friend|extern|static_assert|public|private|TEST|INSTANTIATE)", statement):
        return None
    declarator = re.split(r"(?<![=!<>+*/|&^-])=(?!=)", statement)[0].strip()
    plain = _without_angles(declarator)
    if (match := _FUNCTION.search(plain)) and match.group(1) not in _NOT_NAMES:
        if "::" in plain[:plain.find("(")].split()[-1]:
            return None  # a member, defined outside of its class
        inside = declarator[declarator.find("("):]
        return match.group(1), _parameters(inside)
    if " " in plain and (match := _VARIABLE.search(plain)) and match.group(1) not in _NOT_NAMES:
        return match.group(1), None
    return None


def private_names(text):
    """Yields (namespace, name, parameters, line) of everything at the level of a namespace that only
    its own source is to see."""
    text = _SILENT.sub(lambda match: re.sub(r"[^\n]", " ", match.group()), text)
    # Each open brace: the namespace's name, "" for an unnamed one, None for anything else.
    open_braces, start = [], 0
    for index, character in enumerate(text):
        if character not in "{};":
            continue
        statement = text[start:index].strip()
        at_level = None not in open_braces
        if character == "{" and at_level and (match := _NAMESPACE.search(statement)):
            open_braces.append(match.group(1) or "")
            start = index + 1
            continue
        if at_level and character in "{;":
            is_static = re.match(r"static\b", statement)
            declared = _name_in(re.sub(r"^static\b", "", statement))
            forward = character == ";" and (declared and declared[1] is not None
                                            or re.match(r"^(class|struct|enum)\b", statement))
            if declared and not forward and ("" in open_braces or is_static):
                line = text.count("\n", 0, index) + 1
                yield "::".join(name for name in open_braces if name), *declared, line
        if character == "{":
            open_braces.append(None)
        elif character == "}" and open_braces:
            open_braces.pop()
        if None not in open_braces:
            start = index + 1


_LISTED = re.compile(r"\$\{CMAKE_CURRENT_SOURCE_DIR\}(?:/([\w/]+))?(?=[\s)])")


def targets(root):
    """Yields lists of the sources of each target that may be compiled several at a time, relative to
    the root: of every kestro_library and kestro_tests."""
    root = pathlib.Path(root)
    for file in sorted(root.rglob("CMakeLists.txt")):
        if "build" in file.relative_to(root).parts:
            continue
        for call in re.findall(r"kestro_(?:library|tests)\((.*?)\)\n", file.read_text(), re.DOTALL):
            part = re.search(r"SOURCES_IN(.*?)(?=\b(?:LINK|HEADERS|PRIVATE_LINK|PRECOMPILED)\b|$)",
                             call + " ", re.DOTALL)
            if part is None:
                continue
            folders = [match.group(1) or "." for match in _LISTED.finditer(part.group(1) + " ")]
            yield sorted(path.relative_to(root).as_posix() for folder in folders
                         for path in (file.parent / folder).glob("*.cpp") if path.name != "main.cpp")


def clashes(root):
    """Every name that two sources of a target give, as "name: source:line, source:line". Functions of
    one name may differ in their parameters; anything else may not share its name at all."""
    root = pathlib.Path(root)
    faults = []
    for sources in targets(root):
        places = collections.defaultdict(dict)
        for path in sources:
            for namespace, name, parameters, line in private_names(
                    (root / path).read_text(encoding="utf-8")):
                places[namespace, name].setdefault((path, parameters), line)
        for (_, name), found in sorted(places.items()):
            kinds = collections.Counter(parameters for _, parameters in found)
            clashing = [f"{path}:{line}" for (path, parameters), line in found.items()
                        if None in kinds and len(found) > 1 or kinds[parameters] > 1]
            if len({place.rsplit(":", 1)[0] for place in clashing}) > 1:
                faults.append(f"{name}: {', '.join(clashing)}")
    return faults
