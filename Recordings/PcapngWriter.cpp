// SPDX-License-Identifier: MIT
#include "Recordings/PcapngWriter.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapngComposer.h"
#include "Recordings/PcapngFormat.h"

namespace kestro {

Result<PcapngWriter> PcapngWriter::create(const std::string& path, std::string_view madeUp) {
  auto file = OutputFile::create(path);
  if (!file) return tl::unexpected(file.error());
  PcapngWriter writer(*std::move(file));
  writer._madeUp = madeUp;
  if (auto begun = writer.beginSection({}); !begun) return tl::unexpected(begun.error());
  return writer;
}

Result<void> PcapngWriter::setMadeUp(std::string_view madeUp) {
  if (madeUp == _madeUp) return {};
  _madeUp = madeUp;
  return beginSection({});
}

Result<void> PcapngWriter::beginSection(std::span<const std::string> notes) {
  std::vector<std::string> comments;
  if (!_madeUp.empty()) comments.push_back(std::string(kMadeUpComment) + _madeUp);
  comments.insert(comments.end(), notes.begin(), notes.end());
  _interfaces.clear();
  _blocks.clear();
  appendPcapngSection(_blocks, comments);
  return _file.write(_blocks);
}

Result<void> PcapngWriter::write(const RecordedMessage& message) {
  const auto linkType = linkTypeOfTechnology(message.technology);
  if (!linkType) {
    return failure(
        fmt::format("{}: \"{}\" is no technology to record", _file.name(), message.technology));
  }
  if (message.bytes.size() > kMaximumPcapMessageSize) {
    return failure(fmt::format("{}: a message of {} bytes is longer than a capture can hold ({})",
                               _file.name(), message.bytes.size(), kMaximumPcapMessageSize));
  }
  _blocks.clear();
  const auto found = std::ranges::find(_interfaces, message.technology);
  const auto interface = static_cast<std::uint32_t>(found - _interfaces.begin());
  if (found == _interfaces.end()) {
    const auto name = technologyOfLinkType(*linkType).value();
    appendPcapngInterface(_blocks, static_cast<std::uint16_t>(*linkType), name);
    _interfaces.push_back(name);
  }
  appendPcapngPacket(_blocks, interface, message);
  return _file.write(_blocks);
}

Result<void> PcapngWriter::writeClosingNotes(std::span<const std::string> notes) {
  return notes.empty() ? Result<void>() : beginSection(notes);
}

}  // namespace kestro
