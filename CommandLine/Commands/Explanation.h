// SPDX-License-Identifier: MIT
// One run of `kestro-cli explain`.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Formats/ExplainWriter.h"
#include "CommandLine/Formats/PacketNames.h"
#include "CommandLine/InputFeed.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"

namespace kestro {

struct ExplainOptions {
  InputOptions inputs;
  std::optional<MessageNumbers> messages;  ///< absent: every one
  bool isList = false;                     ///< only what packets are
  std::string format;
  std::optional<LogPriority> shownLog;
};

/// Explains the packets of its inputs, each as its technology has it. Property lists are passed
/// over, but listed.
class Explanation {
 public:
  Explanation(const ExplainOptions& options, InputFeed feed);

  /// The exit status.
  [[nodiscard]] int run();

 private:
  struct Technology {
    std::unique_ptr<LogGenerator> generator;
    PacketNames names;
  };

  [[nodiscard]] Technology* technologyNamed(std::string_view name);
  [[nodiscard]] bool goesOn() const;
  [[nodiscard]] Result<void> explain(const InputMessage& message);
  [[nodiscard]] PacketHead headOf(const InputMessage& message, const Technology& technology) const;
  void write(const PacketHead& head, const InputMessage& message, const Technology& technology);
  void begin();
  [[nodiscard]] bool isNarrowed() const;
  [[nodiscard]] int finish();
  [[nodiscard]] std::string onlyPropertyLists() const;
  [[nodiscard]] std::string nothingFound() const;

  const ExplainOptions& _options;
  InputFeed _feed;
  OfflineServices _services;
  Output _output = Output::standardOutput();
  std::map<std::string_view, Technology> _technologies;
  std::unique_ptr<ExplainWriter> _writer;
  bool _hasBegun = false;
  bool _hasPropertyLists = false;
};

}  // namespace kestro
