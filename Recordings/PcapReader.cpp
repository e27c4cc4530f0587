// SPDX-License-Identifier: MIT
// Reading captures with libpcap.
#include "Recordings/PcapReader.h"

#include <fmt/format.h>
#include <pcap/pcap.h>

#include <filesystem>
#include <utility>

#include "Recordings/PcapFormat.h"

namespace kestro {

struct PcapReader::Handle {
  explicit Handle(pcap_t* opened) : pcap(opened) {}
  Handle(const Handle&) = delete;
  Handle& operator=(const Handle&) = delete;
  ~Handle() { pcap_close(pcap); }

  pcap_t* pcap;
};

namespace {

/// When the record was received, or why its time can be none. A capture's seconds are unsigned and
/// reach to 2106; the library hands over those of files in this machine's byte order as signed.
Result<Moment> momentOf(const timeval& time) {
  constexpr std::int64_t kSecondsEnd = std::int64_t{1} << 32;
  constexpr std::int64_t kMicrosecondsEnd = 1'000'000;
  const std::int64_t written = time.tv_sec;
  const std::int64_t seconds = written < 0 ? written + kSecondsEnd : written;
  if (seconds < 0 || seconds >= kSecondsEnd) return failure("a time beyond the year 2106");
  const std::int64_t microseconds = time.tv_usec;
  if (microseconds < 0 || microseconds >= kMicrosecondsEnd) {
    return failure("a time of more than 999999 microseconds");
  }
  return Moment(std::chrono::seconds(seconds) + std::chrono::microseconds(microseconds));
}

bool isEmptyFile(const std::string& path) {
  std::error_code error;
  return std::filesystem::is_regular_file(path, error) &&
         std::filesystem::file_size(path, error) == 0;
}

}  // namespace

Result<PcapReader> PcapReader::open(const std::string& path) {
  if (isEmptyFile(path)) return failure(fmt::format("{}: the file is empty", path));
  char reason[PCAP_ERRBUF_SIZE] = "";
  pcap_t* pcap =
      pcap_open_offline_with_tstamp_precision(path.c_str(), PCAP_TSTAMP_PRECISION_MICRO, reason);
  if (pcap == nullptr) {
    // Only some of the library's reasons name the file.
    const std::string_view text = reason;
    if (text.starts_with(path)) return failure(std::string(text));
    return failure(fmt::format("{}: {}", path, text));
  }
  auto handle = std::make_unique<Handle>(pcap);
  const int linkType = pcap_datalink(pcap);
  const auto technology = technologyOfLinkType(linkType);
  if (!technology) {
    return failure(
        fmt::format("{}: link type {} stands for no technology (147 to 151 do)", path, linkType));
  }
  return PcapReader(path, std::move(handle), *technology);
}

PcapReader::PcapReader(std::string path, std::unique_ptr<Handle> handle,
                       std::string_view technology)
    : _path(std::move(path)), _handle(std::move(handle)), _technology(technology) {}

PcapReader::PcapReader(PcapReader&&) noexcept = default;
PcapReader& PcapReader::operator=(PcapReader&&) noexcept = default;
PcapReader::~PcapReader() = default;

Result<std::optional<RecordedMessage>> PcapReader::next() {
  if (_error) return tl::unexpected(*_error);
  pcap_pkthdr* header = nullptr;
  const unsigned char* bytes = nullptr;
  const int outcome = pcap_next_ex(_handle->pcap, &header, &bytes);
  if (outcome == PCAP_ERROR_BREAK) return std::nullopt;
  if (outcome != 1) return damaged(pcap_geterr(_handle->pcap));
  const Result<Moment> time = momentOf(header->ts);
  if (!time) return damaged(time.error().message);
  RecordedMessage message{.time = *time,
                          .bytes = {bytes, header->caplen},
                          .number = ++_messageCount,
                          .originalLength = header->len};
  if (message.isCut()) ++_cutMessageCount;
  return message;
}

tl::unexpected<Error> PcapReader::damaged(std::string_view reason) {
  _error = Error{fmt::format("{}: record {}: {}", _path, _messageCount + 1, reason)};
  return tl::unexpected(*_error);
}

}  // namespace kestro
