// SPDX-License-Identifier: MIT
// Bytes as a property list: what parses can be written in both forms and reads back the same.
#include "Fuzz/Harness.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/PropertyList.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/PropertyListDescription.h"

namespace kestro::fuzz {
namespace {

void checkForms(const PropertyListCoding& coding, const Value& value) {
  const auto binary = coding.binary(value);
  if (!binary) return;  // for instance a date outside the years that can be written
  const auto again = coding.parse(*binary);
  require(again.has_value(), "what was written as binary parses");
  // As a value, not as bytes: whether the library writes equal data once or twice depends on where
  // it stands in memory.
  require(*again == value, "what was written as binary reads back the same");
  const auto xml = coding.xml(value);
  require(xml.has_value(), "what can be written as binary can be written as XML");
  require(coding.parse(*xml).has_value(), "what was written as XML parses");
}

}  // namespace

void tryInput(ByteView bytes) {
  static const auto coding = createPropertyListCoding();
  const auto value = coding->parse(bytes);
  if (!value) return;
  checkForms(*coding, *value);
  static_cast<void>(value->deepCopy());
}

}  // namespace kestro::fuzz
