// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/ExplainCommand.h"

#include <fmt/format.h>

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/RecordingFeed.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/ExplainWriter.h"
#include "CommandLine/Formats/LayoutText.h"
#include "CommandLine/Formats/PacketNames.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"
#include "LogGenerator/Packets/PacketHeader.h"
#include "Recordings/PcapReader.h"

namespace kestro {
namespace {

constexpr const char* kExplainText =
    R"(For every packet: time, log code, name and length; then for every value the section that takes it,
its row in a list, its key, the bytes that it was read from with their offset, the bits of the
integer that they make, the raw value and the text that is shown. Offsets count from the packet's
first byte. A value that was computed has a line for each place; one that comes from a property list
has its key there instead of bytes. "--" is a byte past the packet's end, which reads as 0; "BE" an
integer whose most significant byte comes first. A value without a text is not shown; nor is a
list's count, whose text, if it has one, is the number of records where another number is stored.)";

constexpr const char* kExplainExamples =
    R"(  kestro-cli explain drive.pcap | less
  kestro-cli explain drive.pcap --message=12
  kestro-cli explain drive.pcap --code=0xB179 --format=json | jq '.messages[].values[].text')";

struct ExplainOptions {
  std::string capture;
  std::optional<MessageNumbers> messages;  ///< absent: every one
  std::optional<LogCode> code;
  std::string format;
  std::optional<LogPriority> shownLog;
};

/// One run of the command.
class Explanation {
 public:
  Explanation(const ExplainOptions& options, PcapReader reader)
      : _options(options),
        _feed(options.capture, std::move(reader)),
        _services(std::nullopt, options.shownLog) {}

  int run() {
    _generator = _feed.makeGenerator(_services.forGenerator());
    if (!_generator) return kExitNothingDone;
    const PacketNames names(*_generator);
    if (names.isEmpty()) {
      return fail(
          fmt::format("{}: the messages of {} are property lists, not packets; there is "
                      "nothing to explain",
                      _options.capture, _feed.technology()));
    }
    _names = &names;
    _writer = std::ranges::find(explainFormats(), _options.format, &ExplainFormat::name)
                  ->makeWriter(_output);
    while (isWanted(_feed.messageCount() + 1) && _feed.takeNext(_explain)) {
    }
    return finish();
  }

 private:
  [[nodiscard]] bool isWanted(std::uint64_t nextMessage) const {
    if (!_output.failureMessage().empty()) return false;
    return !_options.messages || nextMessage <= _options.messages->last;
  }

  void explain(const RecordedMessage& message) {
    if (_options.messages && !_options.messages->contains(message.number)) return;
    PacketHead head{
        .message = message.number, .time = message.time, .packet = packetOfMessage(message.bytes)};
    head.prefixLength = message.bytes.size() - head.packet.size();
    if (message.bytes.size() >= kPacketHeaderSize) {
      head.code = logCodeOf(PacketView(head.packet));
      head.name = _names->nameOf(*head.code);
    }
    if (_options.code && head.code != _options.code) return;
    write(head, message.bytes);
  }

  void write(const PacketHead& head, ByteView message) {
    begin();
    _writer->beginPacket(head);
    bool hasValues = false;
    _generator->explainMessage(message, [&](const ExplainedValue& value) {
      hasValues = true;
      _writer->value(value);
    });
    _writer->endPacket(hasValues ? "" : _names->reasonForNothing(message));
  }

  /// Before the first packet: what finds none writes nothing.
  void begin() {
    if (!_hasBegun) _writer->begin(_feed.technology());
    _hasBegun = true;
  }

  [[nodiscard]] int finish() {
    if (_feed.status() == kExitNothingDone) return kExitNothingDone;
    const bool isChosen = _options.messages || _options.code;
    if (isChosen && !_hasBegun && _output.failureMessage().empty()) return fail(nothingFound());
    begin();
    _writer->finish();
    _output.flush();
    if (!_output.failureMessage().empty()) return fail(_output.failureMessage());
    return _feed.status();
  }

  [[nodiscard]] std::string nothingFound() const {
    std::string what = "no message";
    if (const auto& numbers = _options.messages) {
      what += fmt::format(" {}", numbers->first);
      if (numbers->last != numbers->first) what += fmt::format(" to {}", numbers->last);
    }
    if (_options.code) what += fmt::format(" of log code {}", logCodeText(*_options.code));
    return fmt::format("{}: there is {}", _options.capture, what);
  }

  static int fail(const std::string& reason) {
    complain(reason);
    return kExitNothingDone;
  }

  const ExplainOptions& _options;
  RecordingFeed _feed;
  OfflineServices _services;
  Output _output = Output::standardOutput();
  std::unique_ptr<LogGenerator> _generator;
  const PacketNames* _names = nullptr;
  std::unique_ptr<ExplainWriter> _writer;
  bool _hasBegun = false;
  const RecordingFeed::Handler _explain = [this](const RecordedMessage& message) -> Result<void> {
    explain(message);
    return {};
  };
};

int runExplain(const ExplainOptions& options) {
  auto reader = PcapReader::open(options.capture);
  if (!reader) {
    complain(reader.error().message);
    return kExitNothingDone;
  }
  return Explanation(options, *std::move(reader)).run();
}

}  // namespace

CommandRow explainCommand() {
  const auto options = std::make_shared<ExplainOptions>();
  return {.name = "explain",
          .help = "Tell which bytes every value of a recorded packet comes from",
          .options = {captureArgument(options->capture), messageOption(options->messages),
                      codeOption(options->code),
                      formatOption(options->format, formatRows(explainFormats())),
                      shownLogOption(options->shownLog)},
          .sections = {{.text = kExplainText},
                       {.title = "Formats",
                        .rows = formatRows(explainFormats()),
                        .text = kTimesAndNumbers},
                       {.title = "Examples", .text = kExplainExamples}},
          .run = [options] { return runExplain(*options); }};
}

}  // namespace kestro
