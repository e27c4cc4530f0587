// SPDX-License-Identifier: MIT
// Capture files as bytes written by hand.
#pragma once

#include <initializer_list>

#include "Platform/Bytes.h"

namespace kestro {

/// A file header, little-endian, microseconds, version 2.4, records of up to 262,144 bytes.
inline Bytes captureHeader(std::uint8_t linkType) {
  return {0xD4, 0xC3, 0xB2, 0xA1, 0x02, 0x00, 0x04, 0x00, 0,        0, 0, 0,
          0,    0,    0,    0,    0x00, 0x00, 0x04, 0x00, linkType, 0, 0, 0};
}

/// Two messages: 2012-03-04 12:05:09.000250 UTC "abc", and 1.5 s later "de".
inline Bytes twoRecords() {
  return {// seconds 1330862709, microseconds 250, captured 3, original 3
          0x75, 0x5A, 0x53, 0x4F, 0xFA, 0x00, 0x00, 0x00, 3, 0, 0, 0, 3, 0, 0, 0, 'a', 'b', 'c',
          // seconds 1330862710, microseconds 500250
          0x76, 0x5A, 0x53, 0x4F, 0x1A, 0xA2, 0x07, 0x00, 2, 0, 0, 0, 2, 0, 0, 0, 'd', 'e'};
}

inline Bytes joined(std::initializer_list<Bytes> parts) {
  Bytes result;
  for (const auto& part : parts) result.insert(result.end(), part.begin(), part.end());
  return result;
}

}  // namespace kestro
