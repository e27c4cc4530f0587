# SPDX-License-Identifier: MIT
"""A list of changes to the sources, each with the tests that must fail for it."""

import contextlib
import dataclasses
import re
import tomllib


class BadList(Exception):
    """The list cannot be used; says what is wrong with which entry."""


@dataclasses.dataclass(frozen=True)
class Change:
    """One entry. `before` stands in `file` once; `after` takes its place."""

    name: str
    file: str
    before: str
    after: str
    program: str
    tests: list

    def problems(self, root):
        """What keeps the entry from being tried in the sources under a folder."""
        found = []
        path = root / self.file
        if not path.is_file():
            found.append(f"there is no {self.file}")
        elif (count := path.read_text("utf-8").count(self.before) if self.before else 0) != 1:
            found.append(f"its text stands in {self.file} {count} times, not once")
        if self.before == self.after:
            found.append("it changes nothing")
        if not self.tests:
            found.append("it names no test")
        return [f"{self.name}: {problem}" for problem in found]

    @contextlib.contextmanager
    def applied(self, root):
        """The sources with the change; without it again at the end, whatever happens."""
        path = root / self.file
        original = path.read_text("utf-8")
        try:
            path.write_text(original.replace(self.before, self.after), "utf-8")
            yield
        finally:
            path.write_text(original, "utf-8")


def parse(text):
    """The entries of a list."""
    names = [field.name for field in dataclasses.fields(Change)]
    changes = []
    for entry in tomllib.loads(text).get("change", []):
        if sorted(entry) != sorted(names):
            raise BadList(f"{entry.get('name', 'an entry')}: it needs {', '.join(names)}")
        changes.append(Change(**entry))
    return changes


def unknown_tests(changes, sources):
    """The tests that a list names and that no source defines."""
    known = set(re.findall(r"\bTEST(?:_F|_P)?\(\s*(\w+),\s*(\w+)\)", "\n".join(sources)))
    return sorted({test for change in changes for test in change.tests
                   if tuple(test.split(".")) not in known})


def checked(changes, root):
    """The changes; raises BadList when one of them cannot be tried under that folder."""
    problems = [problem for change in changes for problem in change.problems(root)]
    names = [change.name for change in changes]
    problems += [f"{name}: the name is used twice" for name in sorted(set(names))
                 if names.count(name) > 1]
    sources = [path.read_text("utf-8") for path in sorted((root / "Tests").rglob("*Test.cpp"))]
    problems += [f"{test}: there is no such test" for test in unknown_tests(changes, sources)]
    if problems:
        raise BadList("\n".join(problems))
    return changes


def survivors(change, failures):
    """What to say of a change: the tests that did not fail. `failures` tells it of a test."""
    return [f"{change.name}: {test} does not fail" for test in change.tests if not failures(test)]
