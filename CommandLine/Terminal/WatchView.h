// SPDX-License-Identifier: MIT
// The ways in which `watch` shows displays.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "CommandLine/Output.h"
#include "Model/KestroModelNode.h"
#include "Platform/Clock.h"

namespace kestro {

/// What a view shows at one moment.
struct WatchState {
  Moment time;           ///< of the last refresh
  std::string status;    ///< "Connecting..." or "Updated …"
  NodePointer tree;      ///< null before the first refresh
  NodePointer previous;  ///< the tree of the refresh before, or null
  /// Where the display comes from: its technology, and what the server says of its source. Empty as
  /// long as nothing is known.
  std::string technology{};
  std::string source{};
  /// Why the values are not renewed: the source has ended, or there is no connection and why.
  std::string notice{};
  bool isRenewed = false;  ///< connected to a source that has not ended
};

/// Shows such states, in one format.
class WatchView {
 public:
  WatchView() = default;
  virtual ~WatchView() = default;
  WatchView(const WatchView&) = delete;
  WatchView& operator=(const WatchView&) = delete;

  /// The display was refreshed: `state.tree` is new.
  virtual void refreshed(const WatchState& state) = 0;
  /// Only the status changed, or the window.
  virtual void changed(const WatchState& state) = 0;
  /// Only what is known of where the display comes from changed, or the notice.
  virtual void noticed(const WatchState& /*state*/) {}
  /// Why nothing more can be shown, as Output has it; an empty text while all is well.
  [[nodiscard]] virtual std::string_view failureMessage() const { return {}; }
  /// Whether the failure is just that nobody reads any more.
  [[nodiscard]] virtual bool readerIsGone() const { return false; }
};

/// A format's name on the command line, what the help says of it, and its view.
struct WatchFormat {
  std::string_view name;
  std::string_view help;  ///< one line or several
  /// `place` says whose display it is: the server's name, or that it is a demo.
  std::unique_ptr<WatchView> (*makeView)(const std::string& place);
};

/// All formats, the default first.
[[nodiscard]] const std::vector<WatchFormat>& watchFormats();

/// The displays one below the other, each after a line with its status and where it comes from, and
/// a line when the connection is lost. Notices go to standard error.
[[nodiscard]] std::unique_ptr<WatchView> makePlainView(Output output);

/// One line of JSON a refresh. Notices go to standard error.
[[nodiscard]] std::unique_ptr<WatchView> makeNdjsonView(Output output);

}  // namespace kestro
