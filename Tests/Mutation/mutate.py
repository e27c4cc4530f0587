# SPDX-License-Identifier: MIT
"""Changes one number of one table at a time, in a copy of the program that tests the decoders, and
says for which changes no test fails."""

import argparse
import collections
import contextlib
import fnmatch
import json
import multiprocessing
import os
import pathlib
import shutil
import subprocess
import sys
import tempfile

import constants
import mutants

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE.parents[1]
TIMEOUT = 30  # seconds; a mutant that makes the tests run longer is found
# What walks every packet of every length takes seconds, and looks for crashes only: not asked.
NOT_ASKED = "*EveryLength*"


class Tests:
    """The tests of a program by the files that hold them."""

    def __init__(self, program):
        with tempfile.TemporaryDirectory() as folder:
            listing = pathlib.Path(folder) / "tests.json"
            command = [program, "--gtest_list_tests", f"--gtest_output=json:{listing}"]
            subprocess.run(command, check=True, stdout=subprocess.DEVNULL)
            suites = json.loads(listing.read_text("utf-8"))["testsuites"]
        self._suites = collections.defaultdict(set)
        for suite in suites:
            for test in suite["testsuite"]:
                self._suites[pathlib.Path(test["file"]).stem].add(f"{suite['name']}.*")

    def filters(self, source):
        """What to run for a table of a source, one after the other until a test fails: the tests of
        the source, and the others."""
        own = ":".join(sorted(self._suites.get(f"{pathlib.Path(source).stem}Test", ())))
        others = f"*-{NOT_ASKED}"
        return [own, f"{others}:{own}"] if own else [others]


class Copy:
    """A copy of the program, for one process to change and run."""

    def __init__(self, program, folder):
        self._path = pathlib.Path(folder) / f"tests-{os.getpid()}"
        shutil.copy(program, self._path)
        with contextlib.suppress(FileExistsError):
            (pathlib.Path(folder) / "Resources").symlink_to(program.resolve().parent / "Resources")

    @contextlib.contextmanager
    def patched(self, patches):
        before = self._write(patches)
        try:
            yield
        finally:
            self._write(before)

    def _write(self, patches):
        """Writes the bytes and returns those that stood there."""
        with open(self._path, "r+b") as file:
            before = []
            for offset, data in patches:
                file.seek(offset)
                before.append((offset, file.read(len(data))))
                file.seek(offset)
                file.write(data)
        return before

    def passes(self, tests):
        """Whether the tests pass, in time."""
        command = [self._path, f"--gtest_filter={tests}", "--gtest_fail_fast", "--gtest_brief=1"]
        try:
            done = subprocess.run(command, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL,
                                  timeout=TIMEOUT, check=False)
        except subprocess.TimeoutExpired:
            return False
        return done.returncode == 0


_copy = None
_tests = None


def _start(program, folder, tests):
    global _copy, _tests
    _copy = Copy(program, folder)
    _tests = tests


def _survives(mutant):
    with _copy.patched(mutant.patches):
        return mutant, all(_copy.passes(tests) for tests in _tests.filters(mutant.source))


def read_equivalents(path):
    """The patterns of mutants that change nothing anybody could see, in a file in which comments
    give the reasons."""
    lines = (line.strip() for line in path.read_text("utf-8").splitlines())
    return [line for line in lines if line and not line.startswith("#")]


def all_mutants(program, root):
    """Every mutant of every table below LogGenerator, by its name."""
    folder = pathlib.Path(root) / "LogGenerator"
    found = {}
    for constant in constants.Image(program).constants(folder, mutants.TABLES):
        source = pathlib.Path(constant.source).relative_to(folder)
        for mutant in mutants.Mutants(constant, source).collect():
            found[mutant.name] = mutant
    return found


def run(program, chosen, jobs):
    """Yields the mutants that survive."""
    tests = Tests(program)
    with tempfile.TemporaryDirectory() as folder:
        _start(program, folder, tests)
        if not _copy.passes(f"*-{NOT_ASKED}"):
            sys.exit("mutate: the tests do not pass as they are")
        with multiprocessing.Pool(jobs, _start, (program, folder, tests)) as pool:
            for number, (mutant, survives) in enumerate(pool.imap_unordered(_survives, chosen), 1):
                if sys.stderr.isatty():
                    print(f"\r{number} of {len(chosen)}", end="", file=sys.stderr)
                if survives:
                    yield mutant


def report(chosen, survivors, equivalents):
    """Prints what was found. Returns whether it is what it should be."""
    known = [name for name in survivors if any(matches(name, p) for p in equivalents)]
    unknown = [name for name in survivors if name not in known]
    stale = [
        p for p in equivalents
        if any(matches(name, p) for name in chosen) and not any(matches(n, p) for n in known)
    ]
    for name in unknown:
        print(f"survives: {name}")
    for pattern in stale:
        print(f"listed as without effect, but found by a test: {pattern}")
    rows = {name.rpartition(": ")[0] for name in chosen}
    print(f"{len(chosen)} mutants of {len(rows)} rows: {len(chosen) - len(survivors)} found by a "
          f"test, {len(known)} without effect, {len(unknown)} survive")
    return not unknown and not stale


def matches(name, pattern):
    """Whether a name fits a pattern in which only * has a meaning."""
    return fnmatch.fnmatchcase(name, pattern.replace("[", "[[]"))


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("program", type=lambda text: pathlib.Path(text).resolve(),
                        help="LogGeneratorTests, unoptimised and with debug symbols")
    parser.add_argument("--root", default=ROOT, help="where its sources lay")
    parser.add_argument("--jobs", type=int, default=os.cpu_count())
    parser.add_argument("--only", default="*", help="a pattern for the mutants' names")
    parser.add_argument("--list", action="store_true", help="only say which there are")
    options = parser.parse_args()

    mutants_by_name = all_mutants(options.program, options.root)
    chosen = [name for name in mutants_by_name if matches(name, options.only)]
    if not chosen:
        sys.exit(f"mutate: none of {len(mutants_by_name)} mutants fits; is the program of this "
                 "place, with debug symbols?")
    if options.list:
        print("\n".join(chosen))
        return 0
    found = run(options.program, [mutants_by_name[name] for name in chosen], options.jobs)
    survivors = sorted(mutant.name for mutant in found)
    equivalents = read_equivalents(HERE / "WithoutEffect.txt")
    return 0 if report(chosen, survivors, equivalents) else 1


if __name__ == "__main__":
    sys.exit(main())
