// SPDX-License-Identifier: MIT
#include "LogGenerator/Ondrel/OndrelLogGenerator.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "LogGenerator/Ondrel/VersionReport.h"
#include "Platform/Bundle.h"
#include "Platform/Clock.h"
#include "Platform/SystemLog.h"

namespace kestro {
namespace {

constexpr std::string_view kExecutableName = "EXECUTABLE_NAME";
constexpr std::uint16_t kReportVersion = 1;

/// Packets of fewer bytes, their type byte included, are not worth an export.
constexpr std::size_t kSmallestExportedBuffer = 2;

std::string versionText(const Bundle& bundle) {
  const auto version = bundle.version();
  return version ? fmt::format("Kestro {}", *version) : "(none)";
}

std::uint64_t reportTime(const Clock& clock) {
  const Moment now = clock.now();
  const auto seconds = std::chrono::floor<std::chrono::seconds>(now.time_since_epoch()).count();
  const auto zone = clock.timeZoneOffset(now).count() / 60;  // toward zero
  return packedReportTime(static_cast<std::uint32_t>(seconds), static_cast<std::int16_t>(zone),
                          clock.isDaylightSaving(now));
}

}  // namespace

ByteView exportedPart(ByteView collected) noexcept {
  return collected.size() < kSmallestExportedBuffer ? ByteView() : collected.subspan(1);
}

void OndrelLogGenerator::collect(ByteView packet) {
  const std::size_t size = _binData.size() + packet.size();
  if (_packetsNotKept != 0 || size > kMaximumEntryBytes) {
    ++_packetsNotKept;
    return;
  }
  if (size > _binData.capacity()) {
    // Grows as a vector does, but to no more than may be needed: the history keeps the room, too.
    _binData.reserve(std::min(std::max(size, 2 * _binData.capacity()), kMaximumEntryBytes));
  }
  _binData.insert(_binData.end(), packet.begin(), packet.end());
}

void OndrelLogGenerator::handOverCollected(Dictionary& state) {
  if (_packetsNotKept != 0) {
    services().systemLog.log(LogPriority::Error,
                             "History: packets beyond 16 MiB are not kept ({} of this entry)",
                             std::exchange(_packetsNotKept, 0));
  }
  const std::size_t size = _binData.size();
  state.set(kStateDisplayState, Value::data(std::exchange(_binData, {})));
  _binData.reserve(size);  // the next refresh brings about as much
}

std::optional<Bytes> OndrelLogGenerator::versionReport(std::size_t size) {
  Bytes report(size, 0);
  std::uint32_t written = 0;
  const Bundle& bundle = services().bundle;
  const int status = QbxDLFAddVersionReport(
      report, static_cast<std::uint32_t>(size), written, kReportVersion, kReportVersion,
      versionText(bundle), kExecutableName, bundle.buildDate(), reportTime(services().clock));
  if (status == kVersionReportWritten) return report;
  services().systemLog.log(LogPriority::Error, "Could not write DLF header (result={})", status);
  return std::nullopt;
}

std::optional<Bytes> OndrelLogGenerator::generateDlfFromState(const Dictionary& state) {
  std::optional<Bytes> dlf = versionReport(kVersionReportSize);
  if (!dlf) return std::nullopt;
  const Array history = state[kStateHistory].array();
  for (const Value& entry : history) {
    const Value packets = entry.dictionary()[kStateDisplayState];
    if (packets.isNull()) continue;
    if (!packets.isData()) {
      services().systemLog.write(
          LogPriority::Error,
          "Got wrong class writing history to DLF; aborting writing the DLF file");
      return std::nullopt;
    }
    const ByteView bytes = exportedPart(packets.bytes());
    dlf->insert(dlf->end(), bytes.begin(), bytes.end());
  }
  return dlf;
}

Array OndrelLogGenerator::getSaveContentsFromState(const Dictionary& state) {
  Array contents = historyOfState(state);
  if (auto dlf = generateDlfFromState(state)) {
    const std::string description = fmt::format("DLF binary ({} bytes)", dlf->size());
    contents.append(Dictionary{{kHistoryDescription, description},
                               {kSaveContentsDlf, Value::data(std::move(*dlf))}});
  }
  return contents;
}

}  // namespace kestro
