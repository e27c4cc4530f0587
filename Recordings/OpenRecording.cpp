// SPDX-License-Identifier: MIT
#include "Recordings/OpenRecording.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>

#include "Recordings/DlfFormat.h"
#include "Recordings/DlfReader.h"
#include "Recordings/PcapReader.h"
#include "Recordings/PcapngReader.h"
#include "Recordings/SnapshotReader.h"

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

bool isVersionReport(ByteView head) noexcept {
  return head.size() >= kShortestDlfRecord &&
         loadLittleEndian<std::uint16_t>(head, 0) >= kShortestDlfRecord &&
         loadLittleEndian<std::uint16_t>(head, kDlfCodeOffset) == kDlfVersionReport;
}

/// In binary form or as XML, which may begin with a byte order mark and blanks.
bool isPropertyList(ByteView head) noexcept {
  using namespace std::string_view_literals;
  constexpr std::array kMarks = {"\xEF\xBB\xBF"sv, "\xFF\xFE"sv, "\xFE\xFF\0"sv};
  constexpr std::array kElements = {"<?xml"sv, "<!--"sv, "<!DOCTYPE"sv, "<plist"sv};
  std::string_view text(reinterpret_cast<const char*>(head.data()), head.size());
  if (text.starts_with("bplist"sv)) return true;
  for (const std::string_view mark : kMarks) {
    if (text.starts_with(mark)) text.remove_prefix(mark.size());
  }
  text.remove_prefix(std::min(text.find_first_not_of(" \t\r\n"sv), text.size()));
  return text.starts_with("<\0"sv) || std::ranges::any_of(kElements, [&](std::string_view element) {
           return text.starts_with(element);
         });
}

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
  if (found != kBeginnings.end()) return found->form;
  if (isVersionReport(head)) return RecordingForm::Dlf;
  if (isPropertyList(head)) return RecordingForm::Snapshot;
  return std::nullopt;
}

Result<std::unique_ptr<RecordingReader>> openRecording(RecordedFile file,
                                                       const RecordingContext& context) {
  const auto head = file.ahead(kRecordingHeadSize);
  if (!head) return tl::unexpected(head.error());
  if (head->empty()) return failure(fmt::format("{}: the file is empty", file.path()));
  const auto form = formOfRecording(*head);
  if (!form) return failure(fmt::format("{}: unknown file format", file.path()));
  switch (*form) {
    case RecordingForm::Pcap:
      return asReader(PcapReader::open(std::move(file)));
    case RecordingForm::Pcapng:
      return asReader(PcapngReader::open(std::move(file)));
    case RecordingForm::Dlf:
      return asReader(DlfReader::open(std::move(file), context));
    case RecordingForm::Snapshot:
      return asReader(SnapshotReader::open(std::move(file), context));
  }
  return failure(fmt::format("{}: unknown file format", file.path()));
}

Result<std::unique_ptr<RecordingReader>> openRecording(const std::string& path,
                                                       const RecordingContext& context) {
  auto file = RecordedFile::open(path);
  if (!file) return tl::unexpected(file.error());
  return openRecording(*std::move(file), context);
}

}  // namespace kestro
