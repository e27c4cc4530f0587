# SPDX-License-Identifier: MIT
"""One word for each technology, spelled in one way, and the checks of a tree against it."""

import pathlib
import re

import documents

WORDS = ("IFX", "GsmUmts", "LTE", "UTRAN", "C2K")

# What has each technology's word in its path; a drive test is only for some of them.
PLACES = (
    "LogGenerator/{word}/*LogGenerator.cpp",
    "Sources/{word}/{word}Simulation.cpp",
    "Benchmarks/{word}*Benchmark.cpp",
    "Fuzz/Corpus/GeneratorFuzz_{word}/*",
    "Tests/LogGenerator/{word}/*LogGeneratorTest.cpp",
    "Tests/Sources/{word}/{word}SimulationTest.cpp",
)

# A word in camel case that is none of WORDS. "GSM" and "UMTS" alone are what the field calls them.
MISSPELLED = re.compile(
    r"(?:Ifx|Lte|Utran|C2k|Gsm(?!Umts)|(?<![Gg]sm)Umts|GSMUMTS|GSMUmts|GsmUMTS)(?![a-z])"
)
IDENTIFIER = re.compile(r"\w+")
# Properties of ModemManager's Signal interface, by the names that it gives them.
GIVEN = {"Gsm", "Umts", "Lte"}
# In the name of a file a word stands in capitals also where code would begin it with a small letter.
NAME_PART = re.compile(r"[A-Za-z0-9]+")
SMALL = {word.lower() for word in WORDS}

TYPE = re.compile(r"^\s*(?:class|struct|enum(?: class)?|using)\s+(\w+)\s*(?:[:={]|final\b)", re.M)
# Where a word is followed by a small letter it is part of another one ("UTRAN" of "UTRANs").
WORD_IN_NAME = re.compile(rf"({'|'.join(WORDS)})(?![a-z])")

CODE_SUFFIXES = (".cpp", ".h", ".py", ".cmake", ".txt", "")
OWN = ("Tests/Structure/words.py", "Tests/Structure/test_words.py")


def paths(root):
    """Every file of ours, relative to the root."""
    return [path.relative_to(root).as_posix() for path in documents.files(root)]


def sources(root):
    """Yields path and text of every file that holds code, the checks' own apart."""
    for path in paths(root):
        suffix = pathlib.PurePosixPath(path).suffix
        if suffix in CODE_SUFFIXES and "/Corpus/" not in path and path not in OWN:
            yield path, (root / path).read_text(encoding="utf-8", errors="replace")


def misspelled_names(root):
    """Every file or folder that spells a technology otherwise, as "path: spelling"."""
    faults = []
    for path in paths(pathlib.Path(root)):
        found = MISSPELLED.findall(path)
        found += [part for part in NAME_PART.findall(path) if part in SMALL]
        faults += [f"{path}: {spelling}" for spelling in found]
    return faults


def misspelled_identifiers(root):
    """Every identifier of code that spells a technology otherwise, as "file:line: identifier"."""
    faults = []
    for path, text in sources(pathlib.Path(root)):
        for number, line in enumerate(text.splitlines(), 1):
            faults += [f"{path}:{number}: {name}" for name in IDENTIFIER.findall(line)
                       if MISSPELLED.search(name) and not ("modem" in path.lower() and name in GIVEN)]
    return faults


def words_in(text):
    """The technologies' words in a path or a name."""
    return set(WORD_IN_NAME.findall(text))


def strangers(root):
    """Every file under two technologies' words, as "path", and every type that has another
    technology's word than its file, as "file: type"."""
    root = pathlib.Path(root)
    faults = [path for path in paths(root) if len(words_in(path)) > 1]
    for path, text in sources(root):
        own = words_in(path)
        faults += [f"{path}: {name}" for name in TYPE.findall(text) if own and words_in(name) - own]
    return faults


def missing_places(root):
    """Every place that a technology's word should lead to and does not."""
    root = pathlib.Path(root)
    wanted = (place.format(word=word) for word in WORDS for place in PLACES)
    return [place for place in wanted if not any(root.glob(place))]
