// SPDX-License-Identifier: MIT
// DLF logs as bytes written by hand.
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

#include "Platform/Bytes.h"

namespace kestro {

/// 2012-03-04 12:05:09 UTC, in seconds.
inline constexpr std::uint64_t kDlfTestSecond = 1'330'862'709;
inline constexpr std::uint64_t kDlfTestTime = kDlfTestSecond * 1'000'000;

/// A record: length, code, time in µs, payload.
inline Bytes dlfRecord(std::uint16_t code, std::uint64_t time, std::string_view payload = {}) {
  const std::size_t length = 12 + payload.size();
  Bytes record = {static_cast<std::uint8_t>(length), static_cast<std::uint8_t>(length >> 8),
                  static_cast<std::uint8_t>(code), static_cast<std::uint8_t>(code >> 8)};
  for (unsigned i = 0; i < 8; ++i) record.push_back(static_cast<std::uint8_t>(time >> (8 * i)));
  record.insert(record.end(), payload.begin(), payload.end());
  return record;
}

/// The record of 161 bytes at the beginning of a log, made at kDlfTestSecond.
inline Bytes dlfVersionReport() {
  Bytes report(161, 0);
  report[0] = 161;
  report[2] = 0xFD;
  report[3] = 0x1F;
  for (unsigned i = 0; i < 4; ++i) {
    report[97 + i] = static_cast<std::uint8_t>(kDlfTestSecond >> (8 * i));
  }
  return report;
}

/// Code 0xB0xx is LTE's, 0x41xx UTRAN2's and Ondrel_GSM's, 0x5xxx Ondrel_GSM's, others nobody's.
inline std::vector<std::string_view> technologiesOfTestCode(std::uint16_t code) {
  if (code >> 8 == 0xB0) return {"LTE"};
  if (code >> 8 == 0x41) return {"UTRAN2", "Ondrel_GSM"};
  if (code >> 12 == 5) return {"Ondrel_GSM"};
  return {};
}

}  // namespace kestro
