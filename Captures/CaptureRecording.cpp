// SPDX-License-Identifier: MIT
// File names and counts of a recording.
#include "Captures/CaptureRecording.h"

#include <fmt/format.h>

#include <filesystem>
#include <utility>

#include "Captures/CaptureFormat.h"

namespace kestro {
namespace {

std::string numberedPath(const std::string& first, std::size_t number) {
  const std::filesystem::path path(first);
  const auto name = fmt::format("{}-{}{}", path.stem().string(), number, path.extension().string());
  return (path.parent_path() / name).string();
}

}  // namespace

Result<CaptureRecording> CaptureRecording::create(const std::string& path,
                                                  std::string_view technology) {
  auto writer = CaptureWriter::create(path, technology);
  if (!writer) return tl::unexpected(writer.error());
  return CaptureRecording(path, technology, std::move(*writer));
}

CaptureRecording::CaptureRecording(const std::string& path, std::string_view technology,
                                   CaptureWriter writer)
    : _files{path}, _technology(technology), _writer(std::move(writer)) {}

Result<void> CaptureRecording::setTechnology(std::string_view technology) {
  if (technology == _technology) return {};
  const auto path = numberedPath(_files.front(), _files.size() + 1);
  auto writer = CaptureWriter::create(path, technology);
  if (!writer) return tl::unexpected(writer.error());
  _writer = std::move(*writer);
  _technology = technology;
  _files.push_back(path);
  return {};
}

Result<void> CaptureRecording::write(Moment time, ByteView message) {
  if (message.size() > kMaximumCapturedMessageSize) {
    ++_leftOutCount;
    return {};
  }
  auto written = _writer.write(time, message);
  if (written) ++_messageCount;
  return written;
}

}  // namespace kestro
