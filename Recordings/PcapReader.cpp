// SPDX-License-Identifier: MIT
// Reading captures with libpcap.
#include "Recordings/PcapReader.h"

#include <fmt/format.h>
#include <pcap/pcap.h>

#include <algorithm>
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

Moment momentOf(const timeval& time) {
  // A damaged record can hold any number of seconds; the end of the year 9999 is the latest time
  // that stays representable in every text and difference made of it.
  constexpr std::int64_t kLatestSecond = 253'402'300'799;
  const auto seconds = std::clamp<std::int64_t>(time.tv_sec, 0, kLatestSecond);
  return Moment(std::chrono::seconds(seconds) + std::chrono::microseconds(time.tv_usec));
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
  if (outcome != 1) {
    _error = Error{
        fmt::format("{}: record {}: {}", _path, _messageCount + 1, pcap_geterr(_handle->pcap))};
    return tl::unexpected(*_error);
  }
  RecordedMessage message{.time = momentOf(header->ts),
                          .bytes = {bytes, header->caplen},
                          .number = ++_messageCount,
                          .originalLength = header->len};
  if (message.isCut()) ++_cutMessageCount;
  return message;
}

}  // namespace kestro
