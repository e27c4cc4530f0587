// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/InputSummary.h"

#include <algorithm>

#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/TelephonyService.h"
#include "Recordings/PositionComment.h"

namespace kestro {
namespace {

std::optional<LogCode> codeOf(const InputMessage& message) {
  if (message.technology == kTqLogChannelTechnology_IFX) return std::nullopt;
  const PacketView packet(packetOfMessage(message.bytes));
  if (packet.size() < kPacketHeaderSize) return std::nullopt;
  return logCodeOf(packet);
}

}  // namespace

void InputSummary::add(const InputMessage& message) {
  all.add(message);
  technologies[message.technology].add(message);
  kinds[{message.technology, codeOf(message)}].add(message);
  first = std::min(first.value_or(message.time), message.time);
  last = std::max(last.value_or(message.time), message.time);
  if (_before && message.time < *_before) ++timesBackCount;
  if (_before && message.time - *_before >= kGap) {
    ++gapCount;
    if (gaps.size() < kMostKept) gaps.push_back({*_before, message.time, message.number});
  }
  _before = message.time;
  if (message.isCut()) ++cutCount;
  if (!message.madeUp.empty() && std::ranges::find(madeUp, message.madeUp) == madeUp.end()) {
    if (madeUp.size() < kMostKept) madeUp.emplace_back(message.madeUp);
  }
  for (const std::string& comment : message.comments) addComment(message, comment);
}

void InputSummary::addComment(const InputMessage& message, const std::string& text) {
  if (positionOfComment(text)) {
    ++positionCount;
    return;
  }
  ++noteCount;
  if (notes.size() < kMostKept) notes.push_back({message.time, message.number, text});
}

void InputSummary::addClosingNote(const std::string& text) {
  ++noteCount;
  if (notes.size() < kMostKept) notes.push_back({std::nullopt, 0, text});
}

}  // namespace kestro
