// SPDX-License-Identifier: MIT
// The kinds of sources that the server offers, by name.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "Platform/LogSourceState.h"
#include "Platform/Platform.h"
#include "Platform/Result.h"
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
};

/// One kind of source.
struct SourceKind {
  std::string_view name;
  bool (*accepts)(std::string_view argument);
  std::string_view form;         ///< as a person types it
  std::string_view description;  ///< for the help, in lines of at most 70 characters
  bool isSimulated;              ///< no baseband has sent its messages
  /// The error says why it cannot yield messages of the technology that is asked for.
  Result<void> (*checkTechnology)(const SourceRequest& request);
  Result<std::unique_ptr<LogSource>> (*open)(const SourceRequest& request, Platform& platform,
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

/// Takes "KIND[:ARGUMENT]" apart; the error says that there is no such kind, that its argument is
/// missing or too much, or that it cannot speak the technology. `technology` as in SourceRequest.
[[nodiscard]] Result<SourceRequest> parseSource(std::string_view text, std::string_view technology);

/// What a server can tell of the source that was asked for.
[[nodiscard]] LogSourceState stateOf(const SourceRequest& request);

/// Opens the source. The error says why that is not possible. The source tells `report` what it
/// leaves out; both references must outlive it.
[[nodiscard]] Result<std::unique_ptr<LogSource>> openSource(const SourceRequest& request,
                                                            Platform& platform,
                                                            const SourceReporter& report);

}  // namespace kestro
