// SPDX-License-Identifier: MIT
// Python's plistlib as a second reader and writer of what we write and read.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>

#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyListCoding.h"
#include "Tests/Platform/Linux/ChildProcess.h"
#include "Tests/Platform/Linux/PropertyListBytes.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro {
namespace {

using testing::TemporaryDirectory;

/// The same list in both languages.
Value sample() {
  using namespace std::chrono;
  const Moment moment = sys_days(2012y / March / 4) + 13h + 5min + 9s;
  return Dictionary{
      {"zebra", Array{Value::integer(-70), Value::integer(255), Value::integer(65536)}},
      {"ant & bee", "caf\xC3\xA9 <\xE4\xB8\xAD>"},
      {"large", Value::unsignedInteger(UINT64_MAX)},
      {"real", Value::real(0.1)},
      {"yes", Value::boolean(true)},
      {"data", Value::data({0x00, 0xFF, 0x7F})},
      {"date", Value::date(moment)},
      {"empty", Dictionary{{"", Array{}}}}};
}
constexpr const char* kPythonSample =
    "{'zebra': [-70, 255, 65536], 'ant & bee': 'caf\\xe9 <\\u4e2d>', 'large': 2**64 - 1,"
    " 'real': 0.1, 'yes': True, 'data': b'\\x00\\xff\\x7f',"
    " 'date': datetime.datetime(2012, 3, 4, 13, 5, 9), 'empty': {'': []}}";

class PropertyListInteroperabilityTest : public ::testing::Test {
 protected:
  /// What a Python script prints; `file` is argument 1.
  [[nodiscard]] std::string python(const std::string& script) const {
    ChildProcess process(
        {"python3", "-c",
         "import datetime, plistlib, sys\nsample = " + std::string(kPythonSample) + "\n" + script,
         file.string()});
    return process.readAll();
  }
  [[nodiscard]] std::string pythonReads(const Bytes& bytes) const {
    std::ofstream(file, std::ios::binary) << textOf(bytes);
    return python(
        "read = plistlib.load(open(sys.argv[1], 'rb'))\n"
        "print('same' if (read, list(read)) == (sample, list(sample)) else read)");
  }
  [[nodiscard]] Value pythonWrites(const std::string& format) const {
    EXPECT_EQ(python("plistlib.dump(sample, open(sys.argv[1], 'wb'), sort_keys=False,"
                     " fmt=plistlib." +
                     format + ")\nprint('done')"),
              "done\n");
    std::ifstream stream(file, std::ios::binary);
    const Bytes bytes{std::istreambuf_iterator<char>(stream), {}};
    const Result<Value> value = coding->parse(bytes);
    EXPECT_TRUE(value) << value.error().message;
    return value.value_or(Value());
  }

  TemporaryDirectory directory;
  std::filesystem::path file = directory.path() / "sample.plist";
  std::unique_ptr<PropertyListCoding> coding = createPropertyListCoding();
};

TEST_F(PropertyListInteroperabilityTest, PythonReadsOurXml) {
  EXPECT_EQ(pythonReads(*coding->xml(sample())), "same\n");
}

TEST_F(PropertyListInteroperabilityTest, PythonReadsOurBinaryLists) {
  EXPECT_EQ(pythonReads(*coding->binary(sample())), "same\n");
}

TEST_F(PropertyListInteroperabilityTest, WeReadPythonsXml) {
  EXPECT_EQ(pythonWrites("FMT_XML"), sample());
}

TEST_F(PropertyListInteroperabilityTest, WeReadPythonsBinaryLists) {
  EXPECT_EQ(pythonWrites("FMT_BINARY"), sample());
}

}  // namespace
}  // namespace kestro
