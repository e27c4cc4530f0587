// SPDX-License-Identifier: MIT
#include "CommandLine/Terminal/WatchView.h"

#include <optional>
#include <utility>

#include "CommandLine/Formats/DisplayFormats.h"
#include "CommandLine/Formats/DisplayText.h"
#include "CommandLine/Terminal/FullScreen.h"
#include "CommandLine/Terminal/TerminalView.h"

namespace kestro {
namespace {

/// A view that writes text and keeps nothing back.
class TextView : public WatchView {
 public:
  explicit TextView(Output output) : _output(std::move(output)) {}

  [[nodiscard]] std::string_view failureMessage() const override {
    return _output.failureMessage();
  }
  [[nodiscard]] bool readerIsGone() const override { return _output.readerIsGone(); }

  void noticed(const WatchState& state) override {
    if (std::exchange(_notice, state.notice) == state.notice || state.notice.empty()) return;
    complain(displayText(state.notice));
  }

 protected:
  void write(std::string_view text) {
    _output.write(text);
    _output.flush();
  }

 private:
  Output _output;
  std::string _notice;
};

class PlainView : public TextView {
 public:
  using TextView::TextView;

  void refreshed(const WatchState& state) override {
    std::string text = state.status;
    for (const std::string& origin : {state.technology, state.source}) {
      if (!origin.empty()) text += " · " + displayText(origin);
    }
    text += "\n\n";
    appendPlainTree(text, *state.tree);
    write(text + "\n");
  }
  void changed(const WatchState& state) override { write(state.status + "\n"); }
};

class NdjsonView : public TextView {
 public:
  using TextView::TextView;

  void refreshed(const WatchState& state) override {
    std::string text;
    appendNdjsonLine(text, {.time = state.time}, *state.tree);
    write(text);
  }
  void changed(const WatchState&) override {}
};

/// The live display in the terminal's window.
class FullScreenView : public WatchView {
 public:
  explicit FullScreenView(std::string place) : _place(std::move(place)) {}

  void refreshed(const WatchState& state) override { draw(state); }
  void changed(const WatchState& state) override { draw(state); }
  void noticed(const WatchState& state) override { draw(state); }

 private:
  void draw(const WatchState& state) {
    _screen.draw(terminalView({.technology = state.technology,
                               .source = state.source,
                               .place = _place,
                               .status = state.status,
                               .notice = state.notice,
                               .tree = state.tree.get(),
                               .previous = state.previous.get(),
                               .isRenewed = state.isRenewed},
                              _screen.size()));
  }

  std::string _place;
  FullScreen _screen;
};

std::unique_ptr<WatchView> makeTreeView(const std::string& place) {
  if (FullScreen::isPossible()) return std::make_unique<FullScreenView>(place);
  return makePlainView(Output::standardOutput());
}

}  // namespace

std::unique_ptr<WatchView> makePlainView(Output output) {
  return std::make_unique<PlainView>(std::move(output));
}

std::unique_ptr<WatchView> makeNdjsonView(Output output) {
  return std::make_unique<NdjsonView>(std::move(output));
}

constexpr std::string_view kTreeHelp =
    "on a terminal the display in its window, redrawn in place, with the values that\n"
    "changed marked (remarks of the decoders on standard error are not shown there:\n"
    "redirect it to keep them); elsewhere one plain display below the other";

const std::vector<WatchFormat>& watchFormats() {
  static const std::vector<WatchFormat> kFormats = {
      {"tree", kTreeHelp, makeTreeView},
      {"ndjson", R"(one line a refresh: "time" (UTC) and "display")",
       [](const std::string&) { return makeNdjsonView(Output::standardOutput()); }},
  };
  return kFormats;
}

}  // namespace kestro
