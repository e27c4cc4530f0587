// SPDX-License-Identifier: MIT
// File names and counts of a recording.
#include "Recordings/PcapRecording.h"

#include <fmt/format.h>

#include <filesystem>
#include <utility>

#include "Recordings/OutputPath.h"
#include "Recordings/PcapFormat.h"

namespace kestro {
namespace {

std::string numberedPath(const std::string& first, std::size_t number) {
  const std::filesystem::path path(first);
  const auto name = fmt::format("{}-{}{}", path.stem().string(), number, path.extension().string());
  return (path.parent_path() / name).string();
}

Result<PcapWriter> createWriter(const std::string& path, std::string_view technology,
                                const std::vector<std::string>& inputs) {
  if (auto checked = checkOutputIsNoInput(path, inputs); !checked) {
    return tl::unexpected(checked.error());
  }
  return PcapWriter::create(path, technology);
}

}  // namespace

Result<PcapRecording> PcapRecording::create(const std::string& path, std::string_view technology,
                                            std::vector<std::string> inputs) {
  auto writer = createWriter(path, technology, inputs);
  if (!writer) return tl::unexpected(writer.error());
  return PcapRecording(path, technology, std::move(*writer), std::move(inputs));
}

PcapRecording::PcapRecording(const std::string& path, std::string_view technology,
                             PcapWriter writer, std::vector<std::string> inputs)
    : _inputs(std::move(inputs)),
      _files{path},
      _technology(technology),
      _writer(std::move(writer)) {}

Result<void> PcapRecording::setTechnology(std::string_view technology) {
  if (technology == _technology) return {};
  if (_files.front() == kStandardOutputPath) {
    return failure(
        fmt::format("{}: the technology has changed from {} to {}, and a pcap capture "
                    "holds one",
                    outputName(_files.front()), _technology, technology));
  }
  const auto path = numberedPath(_files.front(), _files.size() + 1);
  auto writer = createWriter(path, technology, _inputs);
  if (!writer) return tl::unexpected(writer.error());
  _writer = std::move(*writer);
  _technology = technology;
  _files.push_back(path);
  return {};
}

Result<void> PcapRecording::write(Moment time, ByteView message) {
  if (message.size() > kMaximumPcapMessageSize) {
    countLeftOut();
    return {};
  }
  auto written = _writer.write(time, message);
  if (written) countMessage();
  return written;
}

}  // namespace kestro
