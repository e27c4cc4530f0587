// SPDX-License-Identifier: MIT
// Drive-test rows in the technology that each of them was measured in.
#pragma once

#include <string_view>
#include <vector>

#include "Platform/PropertyListCoding.h"
#include "Sources/GsmUmts/GsmUmtsDriveTest.h"
#include "Sources/LTE/LTEDriveTest.h"

namespace kestro {

/// Follows the log's network mode: LTE rows (5G counts as LTE) on the LTE channel, UMTS and GSM
/// rows on the GSM/UMTS channel. The technology is that of the last row.
class AutoDriveTestEncoder : public DriveTestEncoder {
 public:
  /// Begins with the technology of a row of `first`. `coding` must outlive the encoder.
  AutoDriveTestEncoder(const PropertyListCoding& coding, DriveTestFamily first)
      : _lte(coding), _gsmUmts(coding), _current(&encoderOf(first)) {}

  [[nodiscard]] std::string_view technology() const override { return _current->technology(); }
  [[nodiscard]] std::vector<Bytes> messages(const DriveTestRow& row) override {
    _current = &encoderOf(row.family);
    return _current->messages(row);
  }
  [[nodiscard]] std::uint64_t leftOutCount() const override {
    return _lte.leftOutCount() + _gsmUmts.leftOutCount();
  }

 private:
  [[nodiscard]] DriveTestEncoder& encoderOf(DriveTestFamily family) {
    if (family == DriveTestFamily::LTE) return _lte;
    return _gsmUmts;
  }

  LTEDriveTestEncoder _lte;
  GsmUmtsDriveTestEncoder _gsmUmts;
  DriveTestEncoder* _current;
};

}  // namespace kestro
