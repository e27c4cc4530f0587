// SPDX-License-Identifier: MIT
// Writing captures with libpcap.
#include "Recordings/PcapWriter.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <pcap/pcap.h>
#include <stdio_ext.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <limits>
#include <utility>
#include <vector>

#include "Recordings/OutputPath.h"
#include "Recordings/PcapFormat.h"

namespace kestro {
namespace {

timeval timevalOf(Moment time) {
  constexpr Moment kLatest{std::chrono::seconds{std::numeric_limits<std::uint32_t>::max()}};
  const Moment inside = std::clamp(time, Moment(), kLatest);
  const auto microseconds = inside.time_since_epoch().count();
  return {.tv_sec = microseconds / 1'000'000, .tv_usec = microseconds % 1'000'000};
}

Error writeError(const std::string& path) {
  return Error{fmt::format("{}: cannot write: {}", outputName(path), std::strerror(errno))};
}

/// Opens a file, or a descriptor of its own for standard output; null, with errno, when it fails.
std::FILE* openOutput(const std::string& path) {
  if (path != kStandardOutputPath) return std::fopen(path.c_str(), "wbe");
  const int descriptor = ::fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 0);
  return descriptor < 0 ? nullptr : ::fdopen(descriptor, "wb");
}

}  // namespace

struct PcapWriter::Handle {
  struct PcapCloser {
    void operator()(pcap_t* handle) const { pcap_close(handle); }
  };
  struct DumperCloser {
    void operator()(pcap_dumper_t* handle) const { pcap_dump_close(handle); }
  };

  // Room for the longest record, so that each reaches the system in one piece. Outlives the stream
  // that uses it, which the dumper owns.
  std::vector<char> buffer = std::vector<char>(kMaximumPcapMessageSize + 64);
  std::unique_ptr<pcap_t, PcapCloser> pcap;
  std::unique_ptr<pcap_dumper_t, DumperCloser> dumper;
};

Result<PcapWriter> PcapWriter::create(const std::string& path, std::string_view technology) {
  const auto linkType = linkTypeOfTechnology(technology);
  if (!linkType) {
    return failure(fmt::format("{}: \"{}\" is no technology to record", path, technology));
  }
  auto handle = std::make_unique<Handle>();
  handle->pcap.reset(pcap_open_dead(*linkType, static_cast<int>(kMaximumPcapMessageSize)));
  std::FILE* file = openOutput(path);
  if (file == nullptr) {
    return failure(fmt::format("{}: cannot create: {}", path, std::strerror(errno)));
  }
  std::setvbuf(file, handle->buffer.data(), _IOFBF, handle->buffer.size());
  // Closes the file itself when it fails.
  handle->dumper.reset(pcap_dump_fopen(handle->pcap.get(), file));
  if (!handle->dumper) {
    return failure(fmt::format("{}: {}", path, pcap_geterr(handle->pcap.get())));
  }
  if (pcap_dump_flush(handle->dumper.get()) != 0) return tl::unexpected(writeError(path));
  return PcapWriter(path, std::move(handle));
}

PcapWriter::PcapWriter(std::string path, std::unique_ptr<Handle> handle)
    : _path(std::move(path)), _handle(std::move(handle)) {}

PcapWriter::PcapWriter(PcapWriter&&) noexcept = default;
PcapWriter& PcapWriter::operator=(PcapWriter&&) noexcept = default;
PcapWriter::~PcapWriter() = default;

Result<void> PcapWriter::write(Moment time, ByteView message) {
  if (_error) return tl::unexpected(*_error);
  if (message.size() > kMaximumPcapMessageSize) {
    return failure(fmt::format("{}: a message of {} bytes is longer than a capture can hold ({})",
                               _path, message.size(), kMaximumPcapMessageSize));
  }
  pcap_dumper_t* dumper = _handle->dumper.get();
  const auto length = static_cast<bpf_u_int32>(message.size());
  const pcap_pkthdr header{.ts = timevalOf(time), .caplen = length, .len = length};
  pcap_dump(reinterpret_cast<unsigned char*>(dumper), &header, message.data());
  // The dump itself reports nothing.
  if (pcap_dump_flush(dumper) != 0 || std::ferror(pcap_dump_file(dumper)) != 0) {
    _error = writeError(_path);
    ::__fpurge(pcap_dump_file(dumper));  // what waits would only fail, or block, again
    return tl::unexpected(*_error);
  }
  return {};
}

}  // namespace kestro
