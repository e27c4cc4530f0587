// SPDX-License-Identifier: MIT
#include "LogGenerator/C2K/C2KMeasurer.h"

#include <algorithm>

#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/DisplayTemplate.h"
#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {

C2KMeasurer::C2KMeasurer(const MeasurerServices& services, SeriesTable& series)
    : _packets(makeC2KPacketMeasurers(
          C2KSeriesNames(
              loadTemplate(services.bundle, services.propertyListCoding, kC2KTemplate).dictionary(),
              series),
          _errorRate)) {}

LogCode C2KMeasurer::measure(ByteView message, MeasuredValues& values) {
  if (message.size() < kPacketHeaderSize) return 0;
  const PacketView packet(packetOfMessage(message));
  const LogCode code = logCodeOf(packet);
  const auto measurer = std::ranges::find(_packets, code, &C2KPacketMeasurer::code);
  if (measurer != _packets.end()) (*measurer)->measure(packet, values);
  return code;
}

}  // namespace kestro
