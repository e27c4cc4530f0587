// SPDX-License-Identifier: MIT
// Every packet that any technology's decoders subscribe to, cut at every length.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Ondrel/CellMonitor.h"
#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Platform/TelephonyService.h"
#include "Platform/Virtual/VirtualPlatform.h"
#include "Tests/Support/PacketBytes.h"
#include "Tests/Support/ProgramTemplates.h"
#include "Tests/Support/SubscribedCodes.h"

namespace kestro::testing {
namespace {

/// A generator of one technology with the program's templates, and its state.
class Channel {
 public:
  explicit Channel(std::string_view technology) {
    addTemplates(_platform);
    _generator = LogGenerator::generatorFromTechnology(generatorServices(_platform), technology);
  }

  [[nodiscard]] const LogGenerator& generator() const noexcept { return *_generator; }
  [[nodiscard]] const Value& display() const { return _state[kStateDisplay]; }
  [[nodiscard]] const PropertyListCoding& coding() const noexcept { return *_coding; }

  /// Hands a message over. What it throws must be one of the failures that a packet may raise.
  void receive(ByteView message) {
    try {
      _generator->updateStateWithData(_state, message);
    } catch (const ArrayOutOfBoundsException&) {
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
    }
    static_cast<void>(_platform.systemLog().take());
  }

  /// Drops the packets collected so far.
  void refresh() { static_cast<void>(_generator->generateLogUsingState(_state)); }

 private:
  std::unique_ptr<PropertyListCoding> _coding = createPropertyListCoding();
  VirtualPlatform _platform{*_coding};
  std::unique_ptr<LogGenerator> _generator;
  Dictionary _state;
};

struct Subscription {
  std::string_view technology;
  LogCode code;
};

void PrintTo(const Subscription& subscription, std::ostream* stream) {
  *stream << subscription.technology << " " << CodeDictionary::keyOf(subscription.code);
}

std::string nameOf(const ::testing::TestParamInfo<Subscription>& info) {
  return fmt::format("{}_0x{:04X}", info.param.technology, info.param.code);
}

/// What the technologies' start commands ask for.
std::vector<Subscription> allSubscriptions() {
  std::vector<Subscription> subscriptions;
  for (const std::string_view technology : LogGenerator::technologies()) {
    const Channel channel(technology);
    for (const LogCode code : subscribedCodes(channel.generator())) {
      subscriptions.push_back({technology, code});
    }
  }
  return subscriptions;
}

constexpr std::size_t kFullLength = 300;

/// Packets whose counts are as high as they can be, middling, and different from byte to byte.
std::vector<Bytes> binaryPackets(LogCode code) {
  std::vector<Bytes> packets;
  for (const std::uint8_t filler : Bytes{0xFF, 0x01, 0x42}) {
    packets.push_back(packet(code).length(kFullLength, filler).bytes());
  }
  Bytes mixed = packet(code).length(kFullLength).bytes();
  std::uint32_t state = code + 1;
  for (std::size_t i = kPacketHeaderSize; i < mixed.size(); ++i) {
    state = state * 1664525 + 1013904223;
    mixed[i] = static_cast<std::uint8_t>(state >> 24);
  }
  packets.push_back(std::move(mixed));
  return packets;
}

/// Packets with a cell of each kind, with a dictionary, and with one cell as XML.
std::vector<Bytes> listPackets(LogCode code, const PropertyListCoding& coding) {
  Array cells;
  for (const auto technology :
       {kTqCellMonitorRadioAccessTechnologyGSM, kTqCellMonitorRadioAccessTechnologyUMTS,
        kTqCellMonitorRadioAccessTechnologyUTRAN2, kTqCellMonitorRadioAccessTechnologyLTE}) {
    for (const auto type : {kTqCellMonitorCellTypeServing, kTqCellMonitorCellTypeNeighbor}) {
      cells.append(Dictionary{{kTqCellMonitorCellRadioAccessTechnology, technology},
                              {kTqCellMonitorCellType, type},
                              {kTqCellMonitorCellId, Value::integer(-1)},
                              {kTqCellMonitorUARFCN, Value::real(1)},
                              {kTqCellMonitorRSCP, Value::integer(0x7FFF)}});
    }
  }
  const Dictionary files = {{"kSimFile_ICCID", "8944"}, {"kSimFile_LOCI", cells}};
  return {packet(code).append(*coding.binary(cells)).bytes(),
          packet(code).append(*coding.binary(files)).bytes(),
          packet(code).append(*coding.xml(Array{cells[0]})).bytes()};
}

/// Hands the same message to two channels, in memory that ends with it and in memory that goes on.
class EveryLengthTest : public ::testing::TestWithParam<Subscription> {
 protected:
  void receive(ByteView message) {
    const auto exact = std::make_unique<std::uint8_t[]>(message.size());
    std::ranges::copy(message, exact.get());
    alone.receive({exact.get(), message.size()});

    Bytes followed(message.begin(), message.end());
    followed.resize(message.size() + kNeighborhood, 0xA5);
    among.receive(ByteView(followed).first(message.size()));
  }

  void cutEverywhere(const Bytes& message) {
    for (std::size_t length = 0; length <= message.size(); ++length) {
      receive(ByteView(message).first(length));
      ASSERT_EQ(alone.display(), among.display()) << "at length " << length;
    }
    alone.refresh();
    among.refresh();
  }

  static constexpr std::size_t kNeighborhood = 64;
  Channel alone{GetParam().technology};
  Channel among{GetParam().technology};
};

TEST_P(EveryLengthTest, PacketsAreDecodedWithoutALookBeyondTheirEnd) {
  const LogCode code = GetParam().code;
  for (const Bytes& bytes : binaryPackets(code)) cutEverywhere(bytes);
  if (code < kExtraCodes) return;
  for (const Bytes& bytes : listPackets(code, alone.coding())) cutEverywhere(bytes);
}

TEST_P(EveryLengthTest, SoArePacketsBehindAPrefix) {
  for (Bytes bytes : binaryPackets(GetParam().code)) {
    bytes.resize(50);
    bytes.insert(bytes.begin(), {0x81, 0x00});
    cutEverywhere(bytes);
  }
}

INSTANTIATE_TEST_SUITE_P(AllTechnologies, EveryLengthTest, ::testing::ValuesIn(allSubscriptions()),
                         nameOf);

}  // namespace
}  // namespace kestro::testing
