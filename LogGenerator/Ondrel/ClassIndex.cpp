// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/ClassIndex.h"

#include "Platform/SystemLog.h"
#include "Platform/TextSink.h"

namespace kestro {

ClassIndex::~ClassIndex() { _services.standardOutput.writeLine("Deallocing ClassIndex"); }

Base* ClassIndex::getClass(std::string_view sectionName) const noexcept {
  const auto entry = classDict.find(sectionName);
  return entry == classDict.end() ? nullptr : entry->second;
}

void ClassIndex::status() const {
  // classDict is a dictionary and no text, whatever is registered in it.
  _services.systemLog.write(LogPriority::Warning, "Dictionary = 1");
  _services.systemLog.write(LogPriority::Warning, "String = 0");
}

}  // namespace kestro
