// SPDX-License-Identifier: MIT
// The kinds of sources that the server offers, by name.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "Platform/Clock.h"
#include "Platform/InputStream.h"
#include "Platform/LogSourceState.h"
#include "Platform/MainQueue.h"
#include "Platform/ModemService.h"
#include "Platform/Platform.h"
#include "Platform/PositionService.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/Result.h"
#include "Recordings/OpenRecording.h"
#include "Sources/LogSource.h"

namespace kestro {

/// Asks a source to follow its data from technology to technology.
inline constexpr std::string_view kAutomaticTechnology = "auto";

/// Which source is wanted: "KIND" or "KIND:ARGUMENT".
struct SourceRequest {
  std::string kind;
  std::string argument;
  /// The technology asked for, a constant text of Platform/TelephonyService.h or "auto"; empty to
  /// leave it to the source.
  std::string_view technology;
  /// Of a modem: where its positions come from (`parseGps`), and whether identities are shown
  /// whole.
  std::string gps = {};
  bool isPersonal = false;
};

/// What sources are made with. What it refers to must outlive them.
struct SourceServices {
  const PropertyListCoding& propertyListCoding;
  /// The time of what has none of its own.
  const Clock& clock;
  /// See RecordingContext; may be empty.
  TechnologiesOfCode technologiesOfCode = {};
  /// How streams are read; null where nobody serves them: reading waits then.
  InputStreams* inputStreams = nullptr;
  /// What a modem takes; null where nobody serves it: there is none then.
  MainQueue* mainQueue = nullptr;
  ModemService* modemService = nullptr;
  PositionService* positionService = nullptr;
};

/// A platform's services, streams included; it must outlive the sources.
[[nodiscard]] SourceServices sourceServices(Platform& platform);

/// One kind of source.
struct SourceKind {
  std::string_view name;
  bool (*accepts)(std::string_view argument);
  std::string_view form;         ///< as a person types it
  std::string_view description;  ///< for the help, in lines of at most 70 characters
  bool isSimulated;              ///< no baseband has sent its messages
  bool isEndless;                ///< it goes on until its reader has enough
  /// The error says why it cannot yield messages of the technology that is asked for.
  Result<void> (*checkTechnology)(const SourceRequest& request);
  Result<std::unique_ptr<LogSource>> (*open)(const SourceRequest& request,
                                             const SourceServices& services,
                                             const SourceReporter& report);
};

/// All kinds, the default first.
[[nodiscard]] std::span<const SourceKind> sourceKinds() noexcept;

/// The five technologies' names.
[[nodiscard]] std::span<const std::string_view> technologyNames() noexcept;

/// What may be asked for: the technologies, and "auto".
[[nodiscard]] std::span<const std::string_view> technologyChoices() noexcept;

/// The choice of that name as a constant text; empty when there is none.
[[nodiscard]] std::string_view technologyChosen(std::string_view name) noexcept;

/// The technology of that name as a constant text; empty when there is none.
[[nodiscard]] std::string_view technologyNamed(std::string_view name) noexcept;

/// The kind of that name; null when there is none.
[[nodiscard]] const SourceKind* sourceKindNamed(std::string_view name) noexcept;

/// Takes "KIND[:ARGUMENT]" apart; whatever begins with no kind is a file, a capture. The error says
/// that the kind's argument is missing or too much. `technology` as in SourceRequest; a file
/// without one is followed from technology to technology.
[[nodiscard]] Result<SourceRequest> parseSource(std::string_view text, std::string_view technology);

/// Takes "gpsd[:HOST[:PORT]]" apart; an address of IPv6 stands in brackets. The error says the
/// form.
[[nodiscard]] Result<PositionServer> parseGps(std::string_view text);

/// What a server can tell of the source that was asked for, and of the one that was opened.
[[nodiscard]] LogSourceState stateOf(const SourceRequest& request);
[[nodiscard]] LogSourceState stateOf(const SourceRequest& request, const LogSource& source);

/// Opens the source. The error says why that is not possible. The source tells `report` what it
/// leaves out.
[[nodiscard]] Result<std::unique_ptr<LogSource>> openSource(const SourceRequest& request,
                                                            const SourceServices& services,
                                                            const SourceReporter& report);

/// Likewise of the log in a file that is unread still.
[[nodiscard]] Result<std::unique_ptr<LogSource>> openDriveTest(RecordedFile file,
                                                               std::string_view technology,
                                                               const SourceServices& services,
                                                               const SourceReporter& report);

}  // namespace kestro
