// SPDX-License-Identifier: MIT
// Drive-test rows as messages of the IFX channel.
#pragma once

#include "Platform/PropertyListCoding.h"
#include "Sources/DriveTestSource.h"

namespace kestro {

/// Writes each row as one message: what the row holds, in the log's own numbers. Nothing is made
/// up; a value that the log does not have is left out.
class IFXDriveTestEncoder : public DriveTestEncoder {
 public:
  /// `coding` must outlive the encoder.
  explicit IFXDriveTestEncoder(const PropertyListCoding& coding) : _coding(coding) {}

  [[nodiscard]] std::string_view technology() const override;
  [[nodiscard]] std::vector<Bytes> messages(const DriveTestRow& row) override;

 private:
  const PropertyListCoding& _coding;
};

}  // namespace kestro
