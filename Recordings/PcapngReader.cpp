// SPDX-License-Identifier: MIT
#include "Recordings/PcapngReader.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "Recordings/PcapFormat.h"
#include "Recordings/PcapngOptions.h"

namespace kestro {
namespace {

constexpr std::size_t kSectionFields = 16;
constexpr std::size_t kSimplePacketFields = 4;
constexpr std::size_t kPacketFields = 20;
constexpr std::size_t kLongestMadeUp = 4096;

std::string textOf(PcapngBytes bytes) { return {bytes.view().begin(), bytes.view().end()}; }

}  // namespace

Result<std::unique_ptr<PcapngReader>> PcapngReader::open(RecordedFile file) {
  std::unique_ptr<PcapngReader> reader(new PcapngReader(std::move(file)));
  if (auto read = reader->readToFirstTechnology(); !read) return tl::unexpected(read.error());
  return reader;
}

Result<void> PcapngReader::readToFirstTechnology() {
  while (_technologies.empty()) {
    const auto block = _blocks.next();
    if (!block) return tl::unexpected(block.error());
    if (!*block) break;
    if (auto taken = take(**block); !taken) return tl::unexpected(taken.error());
  }
  if (!_technologies.empty() || !_foreignLinkType) return {};
  return failure(fmt::format("{}: {}", _blocks.file().path(),
                             linkTypeRefusal(static_cast<int>(*_foreignLinkType))));
}

Result<std::optional<RecordedMessage>> PcapngReader::next() {
  if (_error) return tl::unexpected(*_error);
  while (true) {
    const auto block = _blocks.next();
    if (!block) return failed(block.error());
    if (!*block) return std::nullopt;
    auto message = take(**block);
    if (!message) return failed(message.error());
    if (*message) return message;
  }
}

Result<std::optional<RecordedMessage>> PcapngReader::take(const PcapngBlock& block) {
  Result<void> taken;
  if (block.type == PcapngBlockType::SectionHeader) {
    taken = beginSection(block.body);
  } else if (block.type == PcapngBlockType::Interface) {
    taken = addInterface(block.body);
  } else {
    return messageIn(block);
  }
  if (!taken) return _blocks.damaged(taken.error().message);
  return std::nullopt;
}

Result<void> PcapngReader::beginSection(PcapngBytes body) {
  if (body.size() < kSectionFields) return failure("a section header that is too short");
  if (const std::uint16_t version = body.u16(4); version != kPcapngMajorVersion) {
    return failure(fmt::format("a section of version {}.{}; {}.x is read", version, body.u16(6),
                               kPcapngMajorVersion));
  }
  _interfaces.clear();
  _madeUp.clear();
  return forEachPcapngOption(body.from(kSectionFields),
                             [this](PcapngOption code, PcapngBytes value) -> Result<void> {
                               if (code != PcapngOption::Comment) return {};
                               std::string text = textOf(value);
                               if (!text.starts_with(kMadeUpComment))
                                 return addNote(std::move(text));
                               addMadeUp(text.substr(kMadeUpComment.size()));
                               return {};
                             });
}

void PcapngReader::addMadeUp(const std::string& text) {
  constexpr std::string_view kBetween = "; ";
  const auto marked = [&](const std::string& part) {
    return fmt::format("{0}{1}{0}", kBetween, part);
  };
  if (text.empty() || marked(_madeUp).find(marked(text)) != std::string::npos) return;
  if (_madeUp.size() + text.size() > kLongestMadeUp) return;
  if (!_madeUp.empty()) _madeUp += kBetween;
  _madeUp += text;
}

Result<void> PcapngReader::addInterface(PcapngBytes body) {
  if (_interfaces.size() == kMostPcapngInterfaces) {
    return failure(fmt::format("more than {} interfaces", kMostPcapngInterfaces));
  }
  const auto interface = pcapngInterfaceOf(body);
  if (!interface) return tl::unexpected(interface.error());
  _interfaces.push_back(*interface);
  const std::string_view technology = interface->technology;
  if (technology.empty()) {
    if (!_foreignLinkType) _foreignLinkType = interface->linkType;
  } else if (std::ranges::find(_technologies, technology) == _technologies.end()) {
    _technologies.push_back(technology);
  }
  return {};
}

Result<std::optional<RecordedMessage>> PcapngReader::messageIn(const PcapngBlock& block) {
  const auto packet = packetIn(block);
  if (!packet) return _blocks.damaged(packet.error().message);
  const PcapngInterface& interface = _interfaces[packet->interface];
  if (interface.technology.empty()) {
    ++_passedOver;
    return std::nullopt;
  }
  if (packet->time) {
    const auto time = interface.times.momentOf(*packet->time);
    if (!time) return _blocks.damaged("a time outside the years 1 to 9999");
    _lastTime = *time;
  }
  const std::size_t end = packet->data + pcapngPadded(packet->length);
  if (end < block.body.size() || !_notes.empty() || !_comments.empty()) {
    if (auto added = takeComments(block, end); !added) {
      return _blocks.damaged(added.error().message);
    }
  }
  return counted({.time = _lastTime,
                  .technology = interface.technology,
                  .bytes = block.body.view().subspan(packet->data, packet->length),
                  .originalLength = packet->originalLength,
                  .comments = _comments});
}

Result<PcapngReader::Packet> PcapngReader::packetIn(const PcapngBlock& block) const {
  const PcapngBytes& body = block.body;
  const bool isSimple = block.type == PcapngBlockType::SimplePacket;
  Packet packet{.data = isSimple ? kSimplePacketFields : kPacketFields};
  if (body.size() < packet.data) return failure("a packet that is too short");
  if (!isSimple) {
    packet.interface =
        block.type == PcapngBlockType::EnhancedPacket ? body.u32(0) : std::size_t{body.u16(0)};
    packet.time = std::uint64_t{body.u32(4)} << 32 | body.u32(8);
    packet.length = body.u32(12);
    packet.originalLength = body.u32(16);
  }
  if (packet.interface >= _interfaces.size()) {
    return failure(fmt::format("a packet of interface {}, of which there are {}", packet.interface,
                               _interfaces.size()));
  }
  if (isSimple) {
    const std::size_t longest = _interfaces.front().longestPacket;
    packet.originalLength = body.u32(0);
    packet.length = longest == 0 ? packet.originalLength : std::min(packet.originalLength, longest);
  }
  if (packet.length > body.size() - packet.data) {
    return failure(fmt::format("a packet of {} bytes where {} are left", packet.length,
                               body.size() - packet.data));
  }
  return packet;
}

/// What waited comes before the comments that the packet's options hold.
Result<void> PcapngReader::takeComments(const PcapngBlock& block, std::size_t options) {
  if (block.type != PcapngBlockType::SimplePacket && options < block.body.size()) {
    auto added = forEachPcapngOption(
        block.body.from(options), [this](PcapngOption code, PcapngBytes value) -> Result<void> {
          return code == PcapngOption::Comment ? addNote(textOf(value)) : Result<void>();
        });
    if (!added) return added;
  }
  _comments.clear();
  _comments.swap(_notes);
  _notesSize = 0;
  return {};
}

Result<void> PcapngReader::addNote(std::string text) {
  _notesSize += text.size();
  if (_notes.size() == kMostPcapngComments || _notesSize > kLongestPcapngComments) {
    return failure(fmt::format("more than {} comments or {} bytes of them for one packet",
                               kMostPcapngComments, kLongestPcapngComments));
  }
  _notes.push_back(std::move(text));
  return {};
}

tl::unexpected<Error> PcapngReader::failed(const Error& error) {
  _error = error;
  return tl::unexpected(error);
}

}  // namespace kestro
