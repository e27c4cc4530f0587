# SPDX-License-Identifier: MIT
"""Each technology has one word in the tree, and the checks find other spellings."""

import pathlib
import tempfile
import unittest

import words

ROOT = pathlib.Path(__file__).resolve().parents[2]


class Tree(unittest.TestCase):
    def test_no_file_spells_a_technology_otherwise(self):
        self.assertEqual(words.misspelled_names(ROOT), [])

    def test_no_identifier_spells_a_technology_otherwise(self):
        self.assertEqual(words.misspelled_identifiers(ROOT), [])

    def test_nothing_of_one_technology_stands_under_the_word_of_another(self):
        self.assertEqual(words.strangers(ROOT), [])

    def test_each_word_leads_to_all_of_its_technology(self):
        self.assertEqual(words.missing_places(ROOT), [])

    def test_the_checks_read_the_tree(self):
        read = {path for path, _ in words.sources(ROOT)}
        self.assertLessEqual({"LogGenerator/LTE/Measurements.cpp", "Fuzz/CMakeLists.txt",
                              "Benchmarks/compare", "Tests/Mutation/mutate.py"}, read)


class Check(unittest.TestCase):
    """The checks themselves, on small trees of their own."""

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)

    def write(self, path, text=""):
        file = self.root / path
        file.parent.mkdir(parents=True, exist_ok=True)
        file.write_text(text, encoding="utf-8")

    def test_another_spelling_in_a_path_is_found(self):
        self.write("Sources/Lte/Phone.cpp")
        self.write("Fuzz/Corpus/Fuzz/ifx")
        self.write("Sources/IFX/IFXMessage.h")
        self.assertEqual(words.misspelled_names(self.root),
                         ["Fuzz/Corpus/Fuzz/ifx: ifx", "Sources/Lte/Phone.cpp: Lte"])

    def test_each_other_spelling_in_code_is_found(self):
        for name in ("LtePhone", "kIfx", "makeUtran", "C2kState", "GsmCell", "UmtsCell",
                     "GSMUMTSPhone", "GSMUmtsPhone", "GsmUMTSPhone", "Is_Lte"):
            with self.subTest(name):
                self.write("A.cpp", f"\nint {name};\n")
                self.assertEqual(words.misspelled_identifiers(self.root), [f"A.cpp:2: {name}"])

    def test_the_words_and_those_that_only_look_like_them_are_left_alone(self):
        self.write("A.cpp", "LTEPhone GsmUmtsPhone kGsmUmts UTRANState C2KState IFXMessage "
                            "GSMServingCell UMTSSet LtedX CodeFilter lteCell _gsmUmts ifx_message\n")
        self.assertEqual(words.misspelled_identifiers(self.root), [])

    def test_scripts_without_a_suffix_are_read(self):
        self.write("Fuzz/run", "kLte=1\n")
        self.assertEqual(words.misspelled_identifiers(self.root), ["Fuzz/run:1: kLte"])

    def test_what_is_fuzzed_with_is_not_read(self):
        self.write("Fuzz/Corpus/A/x", "Lte\n")
        self.assertEqual(words.misspelled_identifiers(self.root), [])

    def test_a_file_under_two_words_is_found(self):
        self.write("LogGenerator/LTE/UTRANCells.h")
        self.assertEqual(words.strangers(self.root), ["LogGenerator/LTE/UTRANCells.h"])

    def test_a_type_with_the_word_of_another_technology_is_found(self):
        self.write("LogGenerator/LTE/Cells.h", "class UTRANCell;\nclass UTRANList : Base {\n"
                                               "struct LTECell {\nusing C2KCell = int;\n")
        self.assertEqual(words.strangers(self.root), ["LogGenerator/LTE/Cells.h: UTRANList",
                                                      "LogGenerator/LTE/Cells.h: C2KCell"])

    def test_shared_files_may_name_every_technology(self):
        self.write("Sources/Phones.h", "struct LTEPhone {\nstruct C2KPhone {\n")
        self.assertEqual(words.strangers(self.root), [])

    def test_a_place_that_a_word_does_not_lead_to_is_named(self):
        for word in words.WORDS:
            for place in words.PLACES:
                self.write(place.format(word=word).replace("*", "X"))
        self.assertEqual(words.missing_places(self.root), [])
        (self.root / "Sources/LTE/LTESimulation.cpp").unlink()
        self.assertEqual(words.missing_places(self.root), ["Sources/LTE/LTESimulation.cpp"])


if __name__ == "__main__":
    unittest.main()
