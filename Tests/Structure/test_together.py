# SPDX-License-Identifier: MIT
"""No two sources of a target give one name to different things, and the check finds those that do."""

import pathlib
import tempfile
import unittest

import together

ROOT = pathlib.Path(__file__).resolve().parents[2]


class Tree(unittest.TestCase):
    def test_no_name_is_given_twice(self):
        self.assertEqual(together.clashes(ROOT), [])

    def test_the_check_reads_every_target(self):
        found = [source for sources in together.targets(ROOT) for source in sources]
        for source in ("App/Panes/KestroPaneController.cpp", "LogGenerator/LTE/Measurements.cpp",
                       "Tests/Model/KestroModelTest.cpp", "Platform/Clock.cpp"):
            self.assertIn(source, found)

    def test_the_check_finds_names(self):
        text = (ROOT / "Options/ArgumentParser.cpp").read_text(encoding="utf-8")
        names = {name for _, name, _, _ in together.private_names(text)}
        self.assertLessEqual({"rangeText", "declareOption", "Taken", "numberIn"}, names)


class Check(unittest.TestCase):
    """The check itself, on small trees of its own."""

    def setUp(self):
        folder = tempfile.TemporaryDirectory()
        self.addCleanup(folder.cleanup)
        self.root = pathlib.Path(folder.name)
        self.write("Room/CMakeLists.txt",
                   "kestro_library(Room\n  SOURCES_IN\n    ${CMAKE_CURRENT_SOURCE_DIR}\n"
                   "    ${CMAKE_CURRENT_SOURCE_DIR}/Inner\n  LINK Other)\n")

    def write(self, path, text):
        file = self.root / path
        file.parent.mkdir(parents=True, exist_ok=True)
        file.write_text(text, encoding="utf-8")

    def names(self, text):
        return [name for _, name, _, _ in together.private_names(text)]

    def clashes_of(self, first, second):
        self.write("Room/First.cpp", first)
        self.write("Room/Inner/Second.cpp", second)
        return together.clashes(self.root)

    def test_a_constant_given_twice(self):
        unnamed = "namespace kestro {{\nnamespace {{\nconstexpr int kSize = {};\n}}\n}}\n"
        self.assertEqual(self.clashes_of(unnamed.format(1), unnamed.format(2)),
                         ["kSize: Room/First.cpp:3, Room/Inner/Second.cpp:3"])

    def test_a_function_given_twice(self):
        unnamed = "namespace {{\nint size({}) {{ return 1; }}\n}}\n"
        same = self.clashes_of(unnamed.format("int a"), unnamed.format("int a"))
        self.assertEqual(same, ["size: Room/First.cpp:2, Room/Inner/Second.cpp:2"])
        self.assertEqual(self.clashes_of(unnamed.format("int a"), unnamed.format("char a")), [])

    def test_a_type_and_a_function_of_one_name(self):
        self.assertEqual(
            len(self.clashes_of("namespace {\nstruct Size {};\n}\n",
                                "namespace {\nint Size(int) { return 1; }\n}\n")), 1)

    def test_what_is_static_counts(self):
        self.assertEqual(len(self.clashes_of("static int count = 0;\n", "static int count = 1;\n")), 1)
        self.assertEqual(len(self.clashes_of("static int f() { return 0; }\n",
                                             "static int f() { return 1; }\n")), 1)

    def test_what_others_see_does_not_count(self):
        self.assertEqual(self.clashes_of("namespace kestro {\nint size() { return 1; }\n}\n",
                                         "namespace kestro {\nint size() { return 1; }\n}\n"), [])

    def test_named_namespaces_keep_names_apart(self):
        self.assertEqual(
            self.clashes_of("namespace a {\nnamespace {\nint kSize = 1;\n}\n}\n",
                            "namespace b {\nnamespace {\nint kSize = 1;\n}\n}\n"), [])

    def test_another_targets_names_do_not_count(self):
        self.write("Other/CMakeLists.txt",
                   "kestro_tests(Other\n  SOURCES_IN ${CMAKE_CURRENT_SOURCE_DIR}\n  LINK Room)\n")
        self.write("Other/Third.cpp", "namespace {\nint kSize = 1;\n}\n")
        self.assertEqual(self.clashes_of("namespace {\nint kSize = 1;\n}\n", ""), [])

    def test_a_main_file_is_a_program_of_its_own(self):
        self.write("Room/main.cpp", "namespace {\nint kSize = 1;\n}\n")
        self.assertEqual(self.clashes_of("namespace {\nint kSize = 1;\n}\n", ""), [])

    def test_every_kind_of_declaration_is_read(self):
        text = """namespace {
// int kInComment = 1;
constexpr const char* kText = "{ int kInText = 1; }";
const std::map<std::string, int> kMap = {{"a", 1}, {"b", 2}};
constexpr NamedValue kValues[] = {{1, "One"}};
std::size_t kProduct = std::size_t{64} * 1024;
enum class Kind { First, Second };
using Name = std::string;
struct Inner final : Base {
  int member = 0;
  int operation() const { return member; }
};
template <class Value, std::size_t kCount = 3>
Value templated(const Value& value) {
  int local = 0;
  return value;
}
[[nodiscard]] std::vector<int> returnsTemplate(std::function<void(int)> call) {
  return {};
}
std::string kRaw = R"(namespace { int kInRaw = 1; })";
}
int kPublic = 1;
"""
        self.assertEqual(self.names(text), ["kText", "kMap", "kValues", "kProduct", "Kind", "Name",
                                            "Inner", "templated", "returnsTemplate", "kRaw"])

    def test_declarations_without_a_body_are_no_second_thing(self):
        self.assertEqual(self.names("namespace {\nint later(int a);\nclass Later;\n}\n"), [])


if __name__ == "__main__":
    unittest.main()
