// SPDX-License-Identifier: MIT
#include "Recordings/OpenRecording.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <utility>

#include "Recordings/PcapReader.h"
#include "Recordings/PcapngReader.h"

namespace kestro {
namespace {

struct Beginning {
  std::uint32_t magic;  ///< the first four bytes, least significant first
  RecordingForm form;
};

constexpr std::array kBeginnings = {
    Beginning{0xA1B2C3D4, RecordingForm::Pcap},    // microseconds, in this byte order and the other
    Beginning{0xD4C3B2A1, RecordingForm::Pcap},    //
    Beginning{0xA1B23C4D, RecordingForm::Pcap},    // nanoseconds
    Beginning{0x4D3CB2A1, RecordingForm::Pcap},    //
    Beginning{0xA1B2CD34, RecordingForm::Pcap},    // with more fields in each record
    Beginning{0x34CDB2A1, RecordingForm::Pcap},    //
    Beginning{0x0A0D0D0A, RecordingForm::Pcapng},  // the same in both byte orders
};

Result<std::unique_ptr<RecordingReader>> asReader(Result<PcapReader> reader) {
  if (!reader) return tl::unexpected(reader.error());
  return std::make_unique<PcapReader>(*std::move(reader));
}

template <class Reader>
Result<std::unique_ptr<RecordingReader>> asReader(Result<std::unique_ptr<Reader>> reader) {
  if (!reader) return tl::unexpected(reader.error());
  return *std::move(reader);
}

}  // namespace

std::optional<RecordingForm> formOfRecording(ByteView head) noexcept {
  const auto magic = loadLittleEndian<std::uint32_t>(head, 0);
  const auto* found = std::ranges::find(kBeginnings, magic, &Beginning::magic);
  if (found == kBeginnings.end()) return std::nullopt;
  return found->form;
}

Result<std::unique_ptr<RecordingReader>> openRecording(RecordedFile file,
                                                       const RecordingContext& /*context*/) {
  const auto head = file.ahead(kRecordingHeadSize);
  if (!head) return tl::unexpected(head.error());
  if (head->empty()) return failure(fmt::format("{}: the file is empty", file.path()));
  const auto form = formOfRecording(*head);
  if (form == RecordingForm::Pcap) return asReader(PcapReader::open(std::move(file)));
  if (form == RecordingForm::Pcapng) return asReader(PcapngReader::open(std::move(file)));
  return failure(fmt::format("{}: unknown file format", file.path()));
}

Result<std::unique_ptr<RecordingReader>> openRecording(const std::string& path,
                                                       const RecordingContext& context) {
  auto file = RecordedFile::open(path);
  if (!file) return tl::unexpected(file.error());
  return openRecording(*std::move(file), context);
}

}  // namespace kestro
