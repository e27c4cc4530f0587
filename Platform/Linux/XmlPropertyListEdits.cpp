// SPDX-License-Identifier: MIT
#include "Platform/Linux/XmlPropertyListEdits.h"

#include <random>

namespace kestro {
namespace {

class KeyBeginnings {
 public:
  std::string next() {
    std::string beginning(kKeyBeginning, ' ');
    std::uint64_t bits = _random();
    for (char& character : beginning) {
      character = static_cast<char>('0' + bits % 64);  // none of them is markup but '<'
      if (character == '<') character = '!';
      bits /= 64;
    }
    return beginning;
  }

 private:
  std::mt19937_64 _random{std::random_device()()};
};

}  // namespace

std::string editedXml(std::string_view list, const PropertyListFacts& facts) {
  KeyBeginnings beginnings;
  std::string result;
  result.reserve(list.size() + kKeyBeginning * facts.edits.size());
  std::size_t done = 0;
  for (const XmlEdit& edit : facts.edits) {
    if (edit.kind == XmlEdit::Kind::Key && !facts.hasManyKeys) continue;
    result += list.substr(done, edit.at - done);
    done = edit.at + edit.length;
    if (edit.kind == XmlEdit::Kind::TextBreak) result += "<![CDATA[]]>";
    if (edit.kind != XmlEdit::Kind::Key) continue;
    const bool isEmpty = edit.length != 0;
    result += isEmpty ? "<key>" + beginnings.next() + "</key>" : beginnings.next();
  }
  result += list.substr(done);
  return result;
}

}  // namespace kestro
