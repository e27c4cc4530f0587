// SPDX-License-Identifier: MIT
// The check of a property list before the library parses it. The library trusts its input: it takes
// time and memory without bound for lists that unfold or nest, cuts texts at a NUL, reads octal
// numbers and drops what it does not understand. A list that passes this check is parsed
// completely, quickly, and with one meaning.
#pragma once

#include <cstdint>
#include <vector>

#include "Platform/Bytes.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Result.h"

namespace kestro {

/// A place in an XML list that the library is to read otherwise (see `editedXml`).
struct XmlEdit {
  enum class Kind : std::uint8_t {
    Key,        ///< behind a <key>, or all of a <key/>: the key gets a beginning of its own
    TextBreak,  ///< a text is divided here
    Zeros,      ///< left out
  };
  std::uint32_t at = 0;
  std::uint32_t length = 0;  ///< of what is replaced
  Kind kind = Kind::TextBreak;
};

/// What the check finds out and the library does not tell.
struct PropertyListFacts {
  /// Whether some integer is above 2^63 - 1. The library shows those and the negative ones alike.
  bool hasLargeIntegers = false;
  /// Whether some date is beyond what the library hands over (see `isLibraryDate`).
  bool hasFarDates = false;

  // Of XML lists alone:
  /// Whether the library would read a number otherwise, or take too long for the texts.
  bool needsEdits = false;
  /// Whether the library would take too long for the keys as they are; `needsEdits` holds, too.
  bool hasManyKeys = false;
  std::vector<XmlEdit> edits;  ///< in the order of their places
};

/// Whether the bytes begin as a binary list of the one version there is, "bplist00".
[[nodiscard]] bool isBinaryPropertyList(ByteView bytes) noexcept;

/// Checks a binary list: everything that the root object reaches lies inside the list, each object
/// has a kind that a property list holds and a well-formed content, keys are texts, and the limits
/// hold, shared objects counted (nodes and bytes) each time they are reached.
[[nodiscard]] Result<PropertyListFacts> scanBinaryPropertyList(ByteView bytes,
                                                               const PropertyListLimits& limits);

/// Checks an XML list: UTF-8 without NUL, well-formed as far as property lists go, numbers, dates
/// and data that mean what they say, and the limits. The value stands in a <plist>, or alone behind
/// an XML declaration. Refused although XML allows them: internal
/// subsets of the DOCTYPE (and with them entities of its own), processing instructions, attributes
/// but for those of <plist>, and comments inside a text.
[[nodiscard]] Result<PropertyListFacts> scanXmlPropertyList(ByteView bytes,
                                                            const PropertyListLimits& limits);

}  // namespace kestro
