// SPDX-License-Identifier: MIT
#include "Platform/Linux/StdioTextSink.h"

#include <string>

namespace kestro {

void StdioTextSink::writeLine(std::string_view line) {
  std::string whole;  // one write, so that lines of several processes do not mix
  whole.reserve(line.size() + 1);
  whole.append(line).push_back('\n');
  std::fwrite(whole.data(), 1, whole.size(), _stream);
  std::fflush(_stream);
}

}  // namespace kestro
