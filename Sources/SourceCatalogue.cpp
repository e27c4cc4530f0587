// SPDX-License-Identifier: MIT
// The table of source kinds.
#include "Sources/SourceCatalogue.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <array>
#include <string>
#include <utility>
#include <vector>

#include "Platform/TelephonyService.h"
#include "Sources/AutoDriveTest.h"
#include "Sources/C2K/C2KSimulation.h"
#include "Sources/CodeTechnologies.h"
#include "Sources/DriveTestSource.h"
#include "Sources/GsmUmts/GsmUmtsSimulation.h"
#include "Sources/IFX/IFXDriveTest.h"
#include "Sources/IFX/IFXSimulation.h"
#include "Sources/LTE/LTESimulation.h"
#include "Sources/Modem/ModemSource.h"
#include "Sources/Modem/ShownText.h"
#include "Sources/PacketSimulation.h"
#include "Sources/RecordingSource.h"
#include "Sources/StoredStream.h"
#include "Sources/StreamSource.h"
#include "Sources/UTRAN/UTRANSimulation.h"

namespace kestro {
namespace {

using OpenedSource = Result<std::unique_ptr<LogSource>>;

constexpr std::array kTechnologies = {
    kTqLogChannelTechnology_IFX, kTqLogChannelTechnology_Ondrel_GSM,
    kTqLogChannelTechnology_Ondrel_CDMA, kTqLogChannelTechnology_Ondrel_LTE,
    kTqLogChannelTechnology_Ondrel_UTRAN2};

// For --technology: all of them, and the wish to follow the source.
constexpr auto kTechnologyChoices = [] {
  std::array<std::string_view, kTechnologies.size() + 1> choices;
  std::ranges::copy(kTechnologies, choices.begin());
  choices.back() = kAutomaticTechnology;
  return choices;
}();

// What is made of logs and streams that do not know better.
std::string_view orDefault(std::string_view technology) {
  return technology.empty() ? kTqLogChannelTechnology_IFX : technology;
}

template <class Baseband>
std::unique_ptr<LogSource> packetSimulation(const PropertyListCoding& coding) {
  return std::make_unique<PacketSimulation>(
      [&coding] { return std::make_unique<Baseband>(coding); });
}

template <class Source>
std::unique_ptr<LogSource> simulation(const PropertyListCoding& coding) {
  return std::make_unique<Source>(coding);
}

/// What can be simulated, and who does it.
struct Simulation {
  std::string_view technology;
  std::unique_ptr<LogSource> (*make)(const PropertyListCoding& coding);
};
constexpr std::array kSimulations = {
    Simulation{kTqLogChannelTechnology_IFX, simulation<IFXSimulation>},
    Simulation{kTqLogChannelTechnology_Ondrel_GSM, packetSimulation<GsmUmtsSimulation>},
    Simulation{kTqLogChannelTechnology_Ondrel_CDMA, packetSimulation<C2KSimulation>},
    Simulation{kTqLogChannelTechnology_Ondrel_LTE, packetSimulation<LTESimulation>},
    Simulation{kTqLogChannelTechnology_Ondrel_UTRAN2, packetSimulation<UTRANSimulation>},
};

template <class Encoder>
std::unique_ptr<DriveTestEncoder> encoder(const PropertyListCoding& coding,
                                          DriveTestFamily /*first*/) {
  return std::make_unique<Encoder>(coding);
}

std::unique_ptr<DriveTestEncoder> autoEncoder(const PropertyListCoding& coding,
                                              DriveTestFamily first) {
  return std::make_unique<AutoDriveTestEncoder>(coding, first);
}

bool takesAll(DriveTestFamily /*family*/) { return true; }
bool takesLTE(DriveTestFamily family) { return family == DriveTestFamily::LTE; }
bool takesGsmUmts(DriveTestFamily family) { return !takesLTE(family); }

/// What a drive-test log can be written as, of which rows, and by whom, given the family of its
/// first row.
struct DriveTestWriter {
  std::string_view technology;
  bool (*takes)(DriveTestFamily family);
  std::unique_ptr<DriveTestEncoder> (*make)(const PropertyListCoding& coding,
                                            DriveTestFamily first);
};
constexpr std::array kDriveTestWriters = {
    DriveTestWriter{kTqLogChannelTechnology_IFX, takesAll, encoder<IFXDriveTestEncoder>},
    DriveTestWriter{kTqLogChannelTechnology_Ondrel_GSM, takesGsmUmts,
                    encoder<GsmUmtsDriveTestEncoder>},
    DriveTestWriter{kTqLogChannelTechnology_Ondrel_LTE, takesLTE, encoder<LTEDriveTestEncoder>},
    DriveTestWriter{kAutomaticTechnology, takesAll, autoEncoder},
};

/// Refuses a technology that no row makes, and names those that there are.
template <class Rows>
Result<void> checkMade(std::string_view kind, std::string_view technology, const Rows& rows) {
  std::vector<std::string_view> made;
  made.reserve(rows.size());
  for (const auto& row : rows) made.push_back(row.technology);
  if (std::ranges::find(made, technology) != made.end()) return {};
  return failure(fmt::format("the source \"{}\" cannot make {} messages, only {}", kind, technology,
                             fmt::join(made, ", ")));
}

std::string_view technologyOfSimulation(const SourceRequest& request) {
  if (!request.technology.empty()) return request.technology;
  const auto technology = technologyNamed(request.argument);
  return technology.empty() ? kTqLogChannelTechnology_Ondrel_LTE : technology;
}

Result<void> checkSimulation(const SourceRequest& request) {
  return checkMade(request.kind, technologyOfSimulation(request), kSimulations);
}

OpenedSource openSimulation(const SourceRequest& request, const SourceServices& services,
                            const SourceReporter& /*report*/) {
  const auto* row =
      std::ranges::find(kSimulations, technologyOfSimulation(request), &Simulation::technology);
  return row->make(services.propertyListCoding);
}

/// What is to be said of a file that is missing and looks like a kind of sources.
std::string hintOfKinds(std::string_view file) {
  if (file.find_first_of("./") != std::string_view::npos) return "";
  std::vector<std::string_view> names;
  for (const SourceKind& kind : sourceKinds()) names.push_back(kind.name);
  return fmt::format(" (nor is it one of the sources {})", fmt::join(names, ", "));
}

// A recording says itself what it speaks.
Result<void> checkCapture(const SourceRequest& /*request*/) { return {}; }

OpenedSource openCapture(const SourceRequest& request, const SourceServices& services,
                         const SourceReporter& report) {
  auto file = RecordedFile::open(request.argument);
  if (!file) return failure(file.error().message + hintOfKinds(request.argument));
  const auto head = file->ahead(kDriveTestHeadSize);
  if (!head) return tl::unexpected(head.error());
  if (isDriveTestLog(*head)) {
    const bool isChosen = !request.technology.empty();
    return openDriveTest(*std::move(file), isChosen ? request.technology : kAutomaticTechnology,
                         services, report);
  }
  const bool followsFile = request.technology == kAutomaticTechnology;
  return RecordingSource::open(*std::move(file),
                               {.coding = services.propertyListCoding,
                                .technologiesOfCode = services.technologiesOfCode,
                                .technology = followsFile ? "" : request.technology},
                               report);
}

Result<void> checkDriveTestTechnology(std::string_view technology) {
  return checkMade("drive-test", technology, kDriveTestWriters);
}

Result<void> checkDriveTest(const SourceRequest& request) {
  return checkDriveTestTechnology(orDefault(request.technology));
}

OpenedSource openNamedDriveTest(const SourceRequest& request, const SourceServices& services,
                                const SourceReporter& report) {
  auto file = RecordedFile::open(request.argument);
  if (!file) return tl::unexpected(file.error());
  return openDriveTest(*std::move(file), orDefault(request.technology), services, report);
}

Result<void> checkStream(const SourceRequest& request) {
  if (request.technology != kAutomaticTechnology) return {};
  return failure("a stream does not say what it speaks; --technology must");
}

OpenedSource openStream(const SourceRequest& request, const SourceServices& services,
                        const SourceReporter& /*report*/) {
  const auto technology = orDefault(request.technology);
  if (services.inputStreams == nullptr) return StoredStream::open(request.argument, technology);
  return StreamSource::open(*services.inputStreams, request.argument, technology);
}

Result<void> checkModem(const SourceRequest& request) {
  const bool isIFX = request.technology.empty() ||
                     request.technology == kTqLogChannelTechnology_IFX ||
                     request.technology == kAutomaticTechnology;
  if (!isIFX) return failure("a modem's messages are IFX; --technology cannot make them another");
  if (request.gps.empty()) return {};
  if (const auto gps = parseGps(request.gps); !gps) return tl::unexpected(gps.error());
  return {};
}

OpenedSource openModem(const SourceRequest& request, const SourceServices& services,
                       const SourceReporter& report) {
  const auto name = modemNamed(request.argument);
  if (!name) return failure(fmt::format("\"{}\" names no modem", request.argument));
  if (services.mainQueue == nullptr || services.modemService == nullptr ||
      services.positionService == nullptr) {
    return failure("a modem is live: kestro-telephonyd plays it");
  }
  ModemWish wish{.modem = *name, .isPersonal = request.isPersonal};
  if (!request.gps.empty()) {
    auto gps = parseGps(request.gps);
    if (!gps) return tl::unexpected(gps.error());
    wish.gps = *std::move(gps);
  }
  return std::make_unique<ModemSource>(ModemServices{.coding = services.propertyListCoding,
                                                     .clock = services.clock,
                                                     .queue = *services.mainQueue,
                                                     .modems = *services.modemService,
                                                     .positions = *services.positionService},
                                       std::move(wish), report);
}

bool isModemName(std::string_view argument) { return modemNamed(argument).has_value(); }

bool isTechnologyOrEmpty(std::string_view argument) {
  return argument.empty() || !technologyNamed(argument).empty();
}

bool isGiven(std::string_view argument) { return !argument.empty(); }

constexpr std::string_view kModemKind = "modem";

constexpr std::array kKinds = {
    SourceKind{"simulation", isTechnologyOrEmpty, "simulation[:TECHNOLOGY]",
               "A made-up drive, the same in every run: cells, path loss, fading,\n"
               "handovers, data transfers. Technology: LTE (unless given), IFX,\n"
               "Ondrel_GSM, Ondrel_CDMA or UTRAN2.",
               true, true, checkSimulation, openSimulation},
    SourceKind{"capture", isGiven, "[capture:]FILE",
               "A recording of any form, with the pauses that it was recorded with:\n"
               "pcap, pcapng, a DLF log, a snapshot, or a drive-test log, which is\n"
               "followed from technology to technology. What begins with no KIND and\n"
               "colon is such a file.",
               false, false, checkCapture, openCapture},
    SourceKind{"drive-test", isGiven, "drive-test:FILE.csv",
               "A drive-test log as phone apps write it, one row a second: columns\n"
               "Timestamp, NetworkMode, RSRP, and what else there is of RSRQ, SNR,\n"
               "RSSI, CQI, NRxRSRP, NRxRSRQ, DL_bitrate, UL_bitrate, CellID, CELLHEX,\n"
               "NODEHEX, LACHEX, RAWCELLID, Operatorname, State, Longitude, Latitude,\n"
               "Speed. Technology: IFX (unless given), where nothing is made up save\n"
               "the neighbour's rank; LTE (the log's LTE and 5G rows) or Ondrel_GSM\n"
               "(its UMTS and GSM rows), where what the log does not hold is made up:\n"
               "physical cell identities, scrambling codes, channels, network code,\n"
               "states, SIM, contexts; auto follows the log from one to the other. A\n"
               "value that was not measured (\"-\") keeps the last one; before there\n"
               "is one, it is left out, with the packets that need it.",
               true, false, checkDriveTest, openNamedDriveTest},
    SourceKind{"stream", isGiven, "stream:PATH",
               "Messages from a file, a pipe or standard input (\"-\") as they arrive,\n"
               "each behind its length (32 bits, little-endian). --technology says\n"
               "what they are; IFX unless given. --speed does not apply.",
               false, false, checkStream, openStream},
    SourceKind{kModemKind, isModemName, "modem[:N|:PATH|:IMEI]",
               "A cellular modem of this machine, by ModemManager: the one with\n"
               "ModemManager's number N (now; it is followed when it comes back under\n"
               "another), of that path or equipment identifier, else the first that\n"
               "is enabled. Its messages are IFX. --gps, --personal and --list-modems\n"
               "go with it. --speed does not apply.",
               false, true, checkModem, openModem},
};

}  // namespace

SourceServices sourceServices(Platform& platform) {
  return {.propertyListCoding = platform.propertyListCoding(),
          .clock = platform.clock(),
          .technologiesOfCode = technologiesByCode(generatorServices(platform)),
          .inputStreams = &platform.inputStreams(),
          .mainQueue = &platform.mainQueue(),
          .modemService = &platform.modemService(),
          .positionService = &platform.positionService()};
}

std::span<const SourceKind> sourceKinds() noexcept { return kKinds; }

std::span<const std::string_view> technologyNames() noexcept { return kTechnologies; }

std::span<const std::string_view> technologyChoices() noexcept { return kTechnologyChoices; }

std::string_view technologyChosen(std::string_view name) noexcept {
  return name == kAutomaticTechnology ? kAutomaticTechnology : technologyNamed(name);
}

std::string_view technologyNamed(std::string_view name) noexcept {
  const auto* found = std::ranges::find(kTechnologies, name);
  return found == kTechnologies.end() ? std::string_view() : *found;
}

const SourceKind* sourceKindNamed(std::string_view name) noexcept {
  const auto* kind = std::ranges::find(kKinds, name, &SourceKind::name);
  return kind == kKinds.end() ? nullptr : kind;
}

Result<SourceRequest> parseSource(std::string_view text, std::string_view technology) {
  const auto colon = text.find(':');
  const auto* kind = sourceKindNamed(text.substr(0, colon));
  if (kind == nullptr) return SourceRequest{"capture", std::string(text), technology};
  const auto argument =
      colon == std::string_view::npos ? std::string_view() : text.substr(colon + 1);
  if (!kind->accepts(argument)) {
    return failure(fmt::format("\"{}\" is no source; the form is {}", text, kind->form));
  }
  SourceRequest request{std::string(kind->name), std::string(argument), technology};
  if (auto spoken = kind->checkTechnology(request); !spoken) return tl::unexpected(spoken.error());
  return request;
}

Result<PositionServer> parseGps(std::string_view text) {
  constexpr std::string_view kGpsd = "gpsd";
  const auto wrong = failure(
      fmt::format("\"{}\" is no source of positions; the form is gpsd[:HOST[:PORT]]", text));
  if (!text.starts_with(kGpsd)) return wrong;
  PositionServer server;
  std::string_view rest = text.substr(kGpsd.size());
  if (rest.empty()) return server;
  if (rest.front() != ':') return wrong;
  rest.remove_prefix(1);
  const bool isBracketed = rest.starts_with('[');
  const auto end = isBracketed ? rest.find(']') : rest.find(':');
  if (isBracketed && end == std::string_view::npos) return wrong;
  server.host = rest.substr(isBracketed ? 1 : 0, isBracketed ? end - 1 : end);
  rest = end == std::string_view::npos ? "" : rest.substr(end + (isBracketed ? 1 : 0));
  if (server.host.empty()) return wrong;
  if (rest.empty()) return server;
  const auto port = rest.front() == ':' ? numberIn(rest.substr(1), 10) : std::nullopt;
  if (!port || *port == 0 || *port > 0xFFFF) return wrong;
  server.port = rest.substr(1);
  return server;
}

LogSourceState stateOf(const SourceRequest& request) {
  LogSourceState state{.kind = request.kind};
  if (const auto* kind = sourceKindNamed(request.kind)) state.isSimulated = kind->isSimulated;
  if (!request.argument.empty()) state.name = request.argument;
  if (request.kind == kModemKind && !request.isPersonal) {
    const auto name = modemNamed(request.argument);
    if (name && name->kind == ModemName::Kind::Equipment) state.name = maskedText(name->text);
  }
  return state;
}

LogSourceState stateOf(const SourceRequest& request, const LogSource& source) {
  LogSourceState state = stateOf(request);
  if (!source.madeUp().empty()) state.isSimulated = true;
  return state;
}

Result<std::unique_ptr<LogSource>> openSource(const SourceRequest& request,
                                              const SourceServices& services,
                                              const SourceReporter& report) {
  const auto* kind = sourceKindNamed(request.kind);
  if (kind == nullptr) return failure(fmt::format("no source \"{}\"", request.kind));
  if (auto spoken = kind->checkTechnology(request); !spoken) return tl::unexpected(spoken.error());
  return kind->open(request, services, report);
}

Result<std::unique_ptr<LogSource>> openDriveTest(RecordedFile file, std::string_view technology,
                                                 const SourceServices& services,
                                                 const SourceReporter& report) {
  if (auto made = checkDriveTestTechnology(technology); !made) return tl::unexpected(made.error());
  const auto* row = std::ranges::find(kDriveTestWriters, technology, &DriveTestWriter::technology);
  const auto makeEncoder = [&, path = file.path()](DriveTestFamily first) {
    if (!row->takes(first)) {
      report(
          fmt::format("{}: it begins with {} rows, which are passed over: they are no {} "
                      "messages (with --technology={} each row is what it was measured in)",
                      path, nameOf(first), technology, kAutomaticTechnology));
    }
    return row->make(services.propertyListCoding, first);
  };
  return DriveTestSource::open(std::move(file), makeEncoder, report);
}

}  // namespace kestro
