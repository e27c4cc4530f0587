# SPDX-License-Identifier: MIT
"""The house: which folder's sources may include what, and the check of a tree against it."""

import dataclasses
import pathlib
import re

# Headers from outside the project, by what they bring in. The first pattern that matches decides.
KINDS = (
    ("qt", r"Q[A-Z]\w*|Qt\w*/.*|ui_\w+\.h"),
    ("property lists", r"plist/.*"),
    ("system log", r"syslog\.h"),
    ("sockets", r"sys/(socket|un)\.h|netinet/.*|arpa/.*|netdb\.h|linux/.*"),
    ("pcap", r"pcap(/.*)?(\.h)?"),
    ("xml", r"expat\.h"),
    ("positions", r"gps\.h"),
    ("databases", r"sqlite3\.h"),
    ("digests", r"sha2\.h"),
    ("command lines", r"CLI/.*"),
    ("json", r"nlohmann/.*"),
    ("tests", r"(gtest|gmock)/.*"),
    ("benchmarks", r"benchmark/.*"),
    ("text", r"fmt/.*"),
    ("results", r"tl/expected\.hpp"),
    ("unicode", r"utf8proc\.h"),
    ("files", r"fstream|filesystem|iostream|cstdio|stdio(_ext)?\.h"),
    ("posix", r"(sys/)?[a-z]+\.h|csignal"),
    ("standard", r"[a-z_]+"),
)

CORE = frozenset({"standard", "text", "results"})
HOSTED = CORE | {"files", "posix"}
LINUX_DOOR = "Platform/Linux/LinuxPlatform.h"


@dataclasses.dataclass(frozen=True)
class Room:
    """What the sources of one folder may include: headers of its own and of `rooms`, the single
    headers in `doors`, and headers from outside of these `kinds`."""

    rooms: tuple
    kinds: frozenset
    doors: tuple = ()


_SOURCES = ("LogGenerator", "Recordings", "Platform")
_MODEL = ("LogGenerator", "Recordings", "Platform")
_SERVER = ("Sources", "Options", *_SOURCES)
_COMMAND_LINE = ("Measurements", "Model", "Options", *_SERVER)
_FORMATS = ("CommandLine", "CommandLine/Formats", *_COMMAND_LINE)
_TERMINAL = ("CommandLine/Terminal", *_FORMATS)
_APP = ("Model", "Options", *_SOURCES, "Sources")
_COMMANDS = HOSTED | {"unicode"}

# A source belongs to the room with the longest path that it lies under; a single file can be one.
ROOMS = {
    "Platform": Room((), CORE),
    "Platform/Virtual": Room(("Platform",), CORE),
    "Platform/Linux": Room(
        ("Platform",), HOSTED | {"qt", "property lists", "system log", "sockets", "positions"}
    ),
    "Options": Room(("Platform",), CORE),
    "Options/ArgumentParser.cpp": Room(
        ("Options", "Platform"), CORE | {"command lines", "files"}
    ),
    "LogGenerator": Room(("Platform",), CORE),
    "Recordings": Room(("Platform",), HOSTED | {"pcap"}),
    "Measurements": Room(
        ("LogGenerator", "Platform"), HOSTED | {"xml", "databases", "digests"}
    ),
    "Model": Room(_MODEL, CORE),
    "Sources": Room(_SOURCES, HOSTED),
    "TelephonyServer": Room(_SERVER, HOSTED),
    "TelephonyServer/main.cpp": Room(
        ("TelephonyServer", *_SERVER), HOSTED, (LINUX_DOOR,)
    ),
    "CommandLine": Room(
        ("CommandLine/Commands", *_TERMINAL), _COMMANDS | {"json"}, (LINUX_DOOR,)
    ),
    "CommandLine/Formats": Room(_FORMATS, HOSTED | {"json", "unicode"}),
    "CommandLine/Terminal": Room(_TERMINAL, HOSTED | {"unicode"}),
    "CommandLine/Commands": Room(_TERMINAL, _COMMANDS, (LINUX_DOOR,)),
    "CommandLine/Extcap": Room(
        ("CommandLine", "CommandLine/Commands", *_SERVER), _COMMANDS, (LINUX_DOOR,)
    ),
    "App": Room(("App/Panes", "App/Toolkit", *_APP), CORE | {"qt"}),
    "App/Program.cpp": Room(
        ("App", "App/Panes", "App/Toolkit", *_APP), HOSTED | {"qt"}, (LINUX_DOOR,)
    ),
    "App/main.cpp": Room(("App",), HOSTED, (LINUX_DOOR,)),
    "App/Panes": Room(("App/Toolkit", *_APP), CORE | {"qt"}),
    "App/Toolkit": Room((), CORE | {"qt"}),
}


def _with_tests(rooms):
    """Tests of a room see the room and what it sees, the helpers of those rooms' tests, both
    platforms and the operating system; only the Linux platform's own tests see its inside.
    Benchmarks and fuzzers see every other room."""
    public = tuple(
        name for name in rooms
        if "." not in name and name.split("/")[0] != "App" and name != "Platform/Linux"
    )
    kinds = HOSTED | {"tests", "json", "sockets"}
    everything = Room(("Tests", *public), kinds, (LINUX_DOOR,))
    all_rooms = dict(rooms)
    all_rooms["Tests"] = everything
    all_rooms["Fuzz"] = everything
    all_rooms["Fuzz/PortFrameFuzz.cpp"] = dataclasses.replace(
        everything,
        rooms=("Fuzz", *everything.rooms),
        doors=(LINUX_DOOR, "Platform/Linux/PortFrameReader.h"),
    )
    all_rooms["Benchmarks"] = dataclasses.replace(everything, kinds=kinds | {"benchmarks"})
    all_rooms["Benchmarks/WindowBenchmark.cpp"] = Room(
        ("App", "App/Panes", "App/Toolkit", "Model", "Platform", "Tests", "Tests/App"), kinds | {"benchmarks", "qt"}
    )
    for name, room in rooms.items():
        if "." in name:
            continue
        seen = {name, *room.rooms, "Platform", "Platform/Virtual", "Tests"}
        seen |= {f"Tests/{lower}" for lower in room.rooms}
        outer = name.split("/")[0]
        if outer != "Platform":  # tests of a room within a room see all of the outer one
            seen |= {inner for inner in rooms if inner.startswith(outer) and "." not in inner}
            seen.add(f"Tests/{outer}")
        all_rooms[f"Tests/{name}"] = Room(tuple(seen), kinds | room.kinds, (LINUX_DOOR,))
    return all_rooms


ALL_ROOMS = _with_tests(ROOMS)
SOURCE_SUFFIXES = (".cpp", ".h")
INCLUDE = re.compile(r'^\s*#\s*include\s*[<"]([^>"]+)[>"]')


def room_of(path):
    """The name of the room that a path (text, relative to the root) lies in; None for no room."""
    parts = path.split("/")
    prefixes = ("/".join(parts[:count]) for count in range(len(parts), 0, -1))
    return next((prefix for prefix in prefixes if prefix in ALL_ROOMS), None)


def kind_of(header):
    """What a header from outside brings in; None for one that the table does not know."""
    return next((kind for kind, pattern in KINDS if re.fullmatch(pattern, header)), None)


def includes(source):
    """Yields the line number and the header of every include directive."""
    for number, line in enumerate(source.read_text(encoding="utf-8").splitlines(), 1):
        match = INCLUDE.match(line)
        if match:
            yield number, match.group(1)


def fault_of_include(root, path, header):
    """Why the source at `path` must not include `header`; None when it may."""
    own = room_of(path)
    room = ALL_ROOMS[own]
    if (root / header).is_file():
        target = room_of(header)
        if target in (own, *room.rooms) or header in room.doors:
            return None
        return f"{own} must not know {target}"
    kind = kind_of(header)
    if kind is None:
        return "neither a path from the root nor a library that the house knows"
    return None if kind in room.kinds else f"{own} must not use {kind}"


def sources(root):
    """Yields every source, relative to the root. Hidden folders and build trees hold none."""
    for folder in sorted(root.iterdir()):
        if not folder.is_dir() or folder.name.startswith(".") or folder.name == "build":
            continue
        for path in sorted(folder.rglob("*")):
            if path.suffix in SOURCE_SUFFIXES:
                yield path.relative_to(root).as_posix()


def wrong_arrows(root):
    """Every include that the house forbids, each as "file:line: header: why"."""
    root = pathlib.Path(root)
    faults = []
    for path in sources(root):
        if room_of(path) is None:
            faults.append(f"{path}: in no room of the house")
            continue
        for number, header in includes(root / path):
            fault = fault_of_include(root, path, header)
            if fault:
                faults.append(f"{path}:{number}: {header}: {fault}")
    return faults


def headers_not_first(root):
    """Every header whose own source does not begin with it, each as "source: header". One that its
    source begins with needs no more to be compiled than it includes itself."""
    root = pathlib.Path(root)
    faults = []
    for path in sources(root):
        header = str(pathlib.PurePosixPath(path).with_suffix(".h"))
        if not path.endswith(".cpp") or not (root / header).is_file():
            continue
        if next((first for _, first in includes(root / path)), None) != header:
            faults.append(f"{path}: {header}")
    return faults


def headers_without_guard(root):
    """Every header that may be included twice with effect."""
    root = pathlib.Path(root)
    return [path for path in sources(root) if path.endswith(".h")
            and "#pragma once" not in (root / path).read_text(encoding="utf-8").splitlines()]
