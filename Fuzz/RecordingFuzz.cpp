// SPDX-License-Identifier: MIT
// Bytes as a recording of whatever form.
#include <memory>
#include <string_view>
#include <vector>

#include "Fuzz/Harness.h"
#include "Fuzz/MemoryFile.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TelephonyService.h"
#include "Recordings/OpenRecording.h"

namespace kestro::fuzz {
namespace {

/// Low codes are of one technology, others of two, odd ones of none.
std::vector<std::string_view> technologiesOf(std::uint16_t code) {
  if (code % 2 != 0) return {};
  if (code < 0x4000) return {kTqLogChannelTechnology_Ondrel_CDMA};
  return {kTqLogChannelTechnology_Ondrel_LTE, kTqLogChannelTechnology_Ondrel_UTRAN2};
}

void read(const std::string& path, std::size_t size, const RecordingContext& context) {
  const auto opened = openRecording(path, context);
  if (!opened) return;
  RecordingReader& reader = **opened;
  std::size_t total = 0;
  while (true) {
    const auto message = reader.next();
    if (!message || !*message) break;
    total += (*message)->bytes.size();
    require(!(*message)->technology.empty(), "every message has a technology");
    // A packet without type byte gets one; a list can hold one value several times.
    const std::size_t most = reader.form() == RecordingForm::Dlf ? 2 * size : size;
    require(reader.form() == RecordingForm::Snapshot || total <= most,
            "messages are no longer than their file");
  }
}

}  // namespace

void tryInput(ByteView bytes) {
  static const auto coding = createPropertyListCoding();
  const MemoryFile file(bytes);
  read(file.path(), bytes.size(), {.coding = *coding, .technologiesOfCode = technologiesOf});
  read(file.path(), bytes.size(),
       {.coding = *coding, .technology = kTqLogChannelTechnology_Ondrel_LTE});
}

}  // namespace kestro::fuzz
