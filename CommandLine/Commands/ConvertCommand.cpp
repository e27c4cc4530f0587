// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/ConvertCommand.h"

#include <fmt/format.h>
#include <unistd.h>

#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Formats/ConvertedForm.h"
#include "CommandLine/InputFeed.h"
#include "CommandLine/StagedFile.h"
#include "Options/ProgramOptions.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Recordings/OutputPath.h"

namespace kestro {
namespace {

constexpr const char* kConvertText =
    R"(Messages keep the times of the inputs. What a form cannot hold is refused, with the form that can: two
technologies in pcap or in a DLF log, property lists (IFX) in a DLF log. Notes, positions and the mark
of what is made up are kept in pcapng only. A message that cannot be kept (a record that was cut; in a
DLF log what is no packet) is named and left out, and the exit status is 3. An existing file is
replaced when the new one is complete.)";

constexpr const char* kConvertExamples =
    R"(  kestro-cli convert drive.csv -o drive.pcapng
  kestro-cli convert monday.pcapng tuesday.pcap -o both.pcapng
  kestro-cli convert drive.pcapng -o lte.dlf --technology=LTE
  kestro-cli convert drive.pcapng -o - --to-format=pcap --technology=LTE | tshark -r -)";

struct ConvertOptions {
  InputOptions inputs;
  std::string output;
  std::string formName;

  [[nodiscard]] const ConversionForm* form() const {
    return formName.empty() ? conversionFormOfFile(output) : conversionFormNamed(formName);
  }
};

/// One run of the command.
class Conversion {
 public:
  Conversion(const ConvertOptions& options, InputFeed feed, StagedFile file)
      : _options(options), _feed(std::move(feed)), _file(std::move(file)) {
    _services.clock().setNow(createSystemClock()->now());  // for inputs without a message
  }

  int run() {
    _form = _options.form()->make({.path = _file.writtenPath(),
                                   .services = _services.forGenerator(),
                                   .clock = _services.clock()});
    const auto take = [this](const InputMessage& message) { return convert(message); };
    _feed.setCutHandler(take);
    while (!_error && _feed.takeNext(take)) {
    }
    if (!_error) finish();
    if (_error) return nothingDone(_file.named(*_error));
    if (_hasLostComments) {
      complain(
          fmt::format("{}: notes, positions and what is made up are not kept in {}; pcapng "
                      "holds them",
                      outputName(_options.output), _options.form()->name));
    }
    return _feed.status();
  }

 private:
  [[nodiscard]] Result<void> convert(const InputMessage& message) {
    if (!begin(message.technology, message.time)) return {};
    const bool hasComments = !message.comments.empty() || !message.madeUp.empty();
    _hasLostComments = _hasLostComments || (hasComments && !_form->keepsComments());
    if (auto problem = _form->problemOf(message); !problem.empty()) return failure(problem);
    keepError(_form->write(message));
    return {};
  }

  [[nodiscard]] bool begin(std::string_view technology, Moment time) {
    if (!std::exchange(_hasBegun, true)) keepError(_form->begin(technology, time));
    return !_error;
  }

  void finish() {
    if (_feed.status() == kExitNothingDone) {
      _error = fmt::format("{}: there is no message to convert", _feed.name());
      return;
    }
    if (!begin(_feed.technology(), _services.clock().now())) return;
    keepError(_form->finish(closingNotes()));
    _form.reset();  // what it has written is complete then
    if (!_error) keepError(_file.commit());
  }

  [[nodiscard]] std::vector<std::string> closingNotes() const {
    std::vector<std::string> notes;
    if (_options.inputs.narrowing.to) return notes;
    for (std::size_t i = 0; i < _feed.inputs().size(); ++i) {
      const auto own = _feed.inputs().reader(i).closingNotes();
      notes.insert(notes.end(), own.begin(), own.end());
    }
    return notes;
  }

  void keepError(const Result<void>& outcome) {
    if (outcome) return;
    _error = outcome.error().message;
    if (!_error->starts_with(_file.writtenPath())) {
      _error = fmt::format("{}: {}", outputName(_options.output), *_error);
    }
  }

  const ConvertOptions& _options;
  OfflineServices _services;
  InputFeed _feed;
  StagedFile _file;
  std::unique_ptr<ConvertedForm> _form;
  std::optional<std::string> _error;
  bool _hasBegun = false;
  bool _hasLostComments = false;
};

std::optional<std::string> outputProblem(const ConvertOptions& options) {
  if (options.form() == nullptr) {
    return fmt::format(
        "{}: its ending tells no form (.pcapng, .pcap, .dlf); --to-format must say it",
        outputName(options.output));
  }
  if (options.output == kStandardOutputPath && ::isatty(STDOUT_FILENO) == 1) {
    return "standard output is a terminal, which shows no recording: redirect it";
  }
  return std::nullopt;
}

int runConvert(const ConvertOptions& options) {
  if (const auto problem = outputProblem(options)) {
    complain(*problem);
    return kExitWrongUsage;
  }
  auto feed = InputFeed::open(options.inputs, false);
  if (!feed) return feed.error();
  const auto checked = checkOutputIsNoInput(options.output, filesOf(options.inputs));
  if (!checked) return nothingDone(checked.error().message);
  auto file = StagedFile::create(options.output);
  if (!file) return nothingDone(file.error().message);
  return Conversion(options, *std::move(feed), *std::move(file)).run();
}

}  // namespace

CommandRow convertCommand() {
  const auto options = std::make_shared<ConvertOptions>();
  const auto forms = formatRows(conversionForms());
  return {.name = "convert",
          .help = "Write recordings in another form",
          .options = withInputRows(options->inputs,
                                   {{.name = "-o,--output",
                                     .value = "FILE",
                                     .help = "The recording to write; - is standard output",
                                     .target = &options->output,
                                     .isRequired = true},
                                    {.name = "--to-format",
                                     .help = "Its form, whatever its name ends in; see below",
                                     .target = &options->formName,
                                     .choices = forms}}),
          .sections = {{.text = kConvertText},
                       {.title = "Forms", .rows = forms, .text = "A file's ending tells its form."},
                       inputsHelp(),
                       {.title = "Examples", .text = kConvertExamples}},
          .run = [options] { return runConvert(*options); }};
}

}  // namespace kestro
