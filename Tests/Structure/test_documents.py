# SPDX-License-Identifier: MIT
"""Links and paths in documents resolve, the README's map is true, property lists have no DOCTYPE."""

import pathlib
import tempfile
import unittest

import documents

ROOT = pathlib.Path(__file__).resolve().parents[2]


class Tree(unittest.TestCase):
    def test_every_relative_link_resolves(self):
        self.assertEqual(documents.broken_links(ROOT), [])

    def test_every_path_in_a_document_is_there(self):
        self.assertEqual(documents.unknown_paths(ROOT), [])

    def test_the_map_of_folders_is_the_folders(self):
        readme = (ROOT / "README.md").read_text(encoding="utf-8")
        self.assertEqual(documents.mapped_folders(readme), documents.existing_folders(ROOT))

    def test_every_promise_of_security_has_its_test(self):
        self.assertEqual(documents.unknown_tests(ROOT, "Documentation/security.md"), [])

    def test_no_property_list_carries_a_doctype(self):
        self.assertEqual(documents.lists_with_doctype(ROOT), [])


class Check(unittest.TestCase):
    """The checks themselves, on small trees of their own."""

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)

    def write(self, path, text):
        file = self.root / path
        file.parent.mkdir(parents=True, exist_ok=True)
        file.write_text(text, encoding="utf-8")

    def test_a_link_to_nowhere_is_found(self):
        self.write("README.md", "See [ports](Documentation/ports.md).\n")
        self.assertEqual(
            documents.broken_links(self.root), ["README.md: Documentation/ports.md"]
        )

    def test_a_link_is_relative_to_its_document(self):
        self.write("README.md", "")
        self.write("Documentation/ports.md", "[up](../README.md#first) [down](README.md)\n")
        self.assertEqual(
            documents.broken_links(self.root), ["Documentation/ports.md: README.md"]
        )

    def test_links_elsewhere_and_in_code_are_not_followed(self):
        self.write("README.md", "[a](https://example.org) [b](#c)\n```\n[d](e)\n```\n")
        self.assertEqual(documents.broken_links(self.root), [])

    def test_a_path_that_is_not_there_is_found(self):
        self.write("Model/Tree.h", "")
        self.write("README.md", "`Model/Tree.h` `Model/Tree` `Model/` `Model/Stem.h` `Model/Tre`\n")
        self.assertEqual(documents.unknown_paths(self.root),
                         ["README.md: Model/Stem.h", "README.md: Model/Tre"])

    def test_paths_of_others_in_code_and_with_placeholders_are_not_looked_for(self):
        self.write("Model/Tree.h", "")
        self.write("README.md", "`build/x` `/Model/x` `Model/*Fuzz.cpp` `Model/WORD/`\n"
                                "```\n`Model/x`\n```\n")
        self.assertEqual(documents.unknown_paths(self.root), [])

    def test_a_test_that_is_none_is_found(self):
        self.write("Tests/A.cpp", "TEST_F(Ports, AreClosed) {}\nTEST(Names,\n     AreKept) {}\n")
        self.write("a.md", "| x | `Ports.AreClosed`, `Names.AreKept` |\n| y | `Ports.AreOpen` |\n")
        self.assertEqual(documents.unknown_tests(self.root, "a.md"), ["Ports.AreOpen"])

    def test_the_map_is_read_from_fenced_lines(self):
        self.assertEqual(
            documents.mapped_folders("Model/ in prose\n```\nApp/    the window\n```\n"), {"App"}
        )

    def test_empty_hidden_and_built_folders_are_not_on_the_map(self):
        self.write("Model/Tree.h", "")
        self.write(".ci/run", "")
        self.write("build/release/x", "")
        self.write("README.md", "")
        (self.root / "App").mkdir()
        self.assertEqual(documents.existing_folders(self.root), {"Model"})

    def test_a_doctype_in_a_property_list_is_found(self):
        self.write("Resources/A.plist", '<!DOCTYPE plist PUBLIC "x">\n<plist/>\n')
        self.write("Resources/B.plist", "<plist/>\n")
        self.assertEqual(documents.lists_with_doctype(self.root), ["Resources/A.plist"])

    def test_a_source_may_hold_a_doctype_as_data(self):
        self.write("Tests/A.cpp", '"<!DOCTYPE plist><plist/>"\n')
        self.assertEqual(documents.lists_with_doctype(self.root), [])


if __name__ == "__main__":
    unittest.main()
