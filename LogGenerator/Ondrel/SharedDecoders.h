// SPDX-License-Identifier: MIT
// The decoders that every technology has: SIM files and packet-data contexts.
#pragma once

#include <string_view>

#include "LogGenerator/Ondrel/SectionDecoder.h"

namespace kestro {

// The namespace is named after the log code of the SIM files.
// NOLINTNEXTLINE(readability-identifier-naming)
namespace LogCode_0xFF0000 {

/// Thrown for a SIM packet that carries no property list. The application lets it end the process.
class UnknownDataException {};

/// The property list of a SIM packet.
class PropertyListReader {
 public:
  /// Throws UnknownDataException, after a line in `log`, when the packet carries no property list.
  PropertyListReader(const Packet& packet, const PropertyListCoding& coding, SystemLog& log);

  /// The value under a key; a null pointer when there is none, or when the root is no dictionary.
  [[nodiscard]] const Value* find(std::string_view key) const { return _files.find(key); }

 private:
  Dictionary _files;
};

}  // namespace LogCode_0xFF0000

inline constexpr PacketKind kSimFilesPacket = {.code = 0xFF0000, .name = "SIM files"};
inline constexpr PacketKind kPacketDataContextsPacket = {.code = 0xFF0002,
                                                         .name = "Packet-data contexts"};

extern const Section kSimInfoSection;
extern const Section kPDPContextListSection;

/// Shows selected SIM files, each as the packet has it. A file that a packet lacks keeps its value.
class SimInfo : public SectionDecoder {
 public:
  explicit SimInfo(const GeneratorServices& services) : SectionDecoder(services, kSimInfoSection) {}

 protected:
  bool updateWithOtherPacket(const Packet& packet, LogCode code) override;
  void explainOtherPacket(const Packet& packet, LogCode code,
                          const ExplainVisitor& visit) const override;
};

/// Shows the packet-data contexts as they are, whatever code their packet carries. A packet without
/// an array changes nothing.
class PDPContextList : public SectionDecoder {
 public:
  explicit PDPContextList(const GeneratorServices& services)
      : SectionDecoder(services, kPDPContextListSection) {}

 protected:
  bool updateWithOtherPacket(const Packet& packet, LogCode code) override;
  void explainOtherPacket(const Packet& packet, LogCode code,
                          const ExplainVisitor& visit) const override;
};

}  // namespace kestro
