// SPDX-License-Identifier: MIT
// Reading captures with libpcap.
#include "Recordings/PcapReader.h"

#include <fmt/format.h>
#include <pcap/pcap.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <utility>

#include "Recordings/PcapFormat.h"

namespace kestro {

struct PcapReader::Handle {
  explicit Handle(RecordedFile opened) : file(std::move(opened)) {}
  Handle(const Handle&) = delete;
  Handle& operator=(const Handle&) = delete;
  ~Handle() {
    if (pcap != nullptr) pcap_close(pcap);
  }

  RecordedFile file;  ///< what the stream that the library owns reads from
  pcap_t* pcap = nullptr;
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

/// The library reads a stream, which reads the file, a pipe too, from the first byte that is
/// unread.
ssize_t readForStream(void* file, char* target, size_t size) {
  const auto count =
      static_cast<RecordedFile*>(file)->read({reinterpret_cast<std::uint8_t*>(target), size});
  return count ? static_cast<ssize_t>(*count) : -1;  // errno is the system's still
}

std::FILE* streamOf(RecordedFile& file) {
  constexpr std::size_t kBufferSize = std::size_t{64} * 1024;
  const cookie_io_functions_t functions = {
      .read = readForStream, .write = nullptr, .seek = nullptr, .close = nullptr};
  std::FILE* stream = ::fopencookie(&file, "r", functions);
  if (stream != nullptr) std::setvbuf(stream, nullptr, _IOFBF, kBufferSize);
  return stream;
}

}  // namespace

Result<PcapReader> PcapReader::open(const std::string& path) {
  auto file = RecordedFile::open(path);
  if (!file) return tl::unexpected(file.error());
  return open(*std::move(file));
}

Result<PcapReader> PcapReader::open(RecordedFile file) {
  const auto head = file.ahead(1);
  if (!head) return tl::unexpected(head.error());
  const std::string path = file.path();
  if (head->empty()) return failure(fmt::format("{}: the file is empty", path));
  auto handle = std::make_unique<Handle>(std::move(file));
  std::FILE* stream = streamOf(handle->file);
  if (stream == nullptr) return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  char reason[PCAP_ERRBUF_SIZE] = "";
  handle->pcap =
      pcap_fopen_offline_with_tstamp_precision(stream, PCAP_TSTAMP_PRECISION_MICRO, reason);
  if (handle->pcap == nullptr) {
    static_cast<void>(std::fclose(stream));  // the library takes it over only when it succeeds
    return failure(fmt::format("{}: {}", path, reason));
  }
  const int linkType = pcap_datalink(handle->pcap);
  const auto technology = technologyOfLinkType(linkType);
  if (!technology) {
    return failure(fmt::format("{}: {}", path, linkTypeRefusal(linkType)));
  }
  return PcapReader(std::move(handle), *technology);
}

PcapReader::PcapReader(std::unique_ptr<Handle> handle, std::string_view technology)
    : _handle(std::move(handle)), _technology(technology) {}

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
  return counted({.time = *time,
                  .technology = _technology,
                  .bytes = {bytes, header->caplen},
                  .originalLength = header->len});
}

std::optional<double> PcapReader::fractionRead() const noexcept {
  return _handle->file.fractionRead();
}

tl::unexpected<Error> PcapReader::damaged(std::string_view reason) {
  _error =
      Error{fmt::format("{}: record {}: {}", _handle->file.path(), messageCount() + 1, reason)};
  return tl::unexpected(*_error);
}

}  // namespace kestro
