// SPDX-License-Identifier: MIT
#include "Platform/SourceTimes.h"

#include <chrono>
#include <utility>

#include "Platform/TelephonyProtocol.h"

namespace kestro {

SourceTimeBytes sourceTimeBytes(Moment time) noexcept {
  SourceTimeBytes bytes{};
  storeLittleEndian(bytes, 0, static_cast<std::uint64_t>(time.time_since_epoch().count()));
  return bytes;
}

bool SourceTimes::isLogData(std::int32_t id, ByteView message) noexcept {
  if (id == messageId(TelephonyMessage::SourceTime)) {
    _next.reset();
    if (message.size() != SourceTimeBytes().size()) return false;
    const auto microseconds =
        static_cast<std::int64_t>(loadLittleEndian<std::uint64_t>(message, 0));
    _next = Moment(std::chrono::microseconds(microseconds));
    return false;
  }
  if (id != messageId(TelephonyMessage::Channel)) return false;
  _time = std::exchange(_next, std::nullopt);
  return true;
}

}  // namespace kestro
