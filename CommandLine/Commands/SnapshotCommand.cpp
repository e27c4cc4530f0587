// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/SnapshotCommand.h"

#include <fmt/format.h>

#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "CommandLine/Commands/Command.h"
#include "CommandLine/Commands/ReplayedInputs.h"
#include "CommandLine/ExitStatus.h"
#include "CommandLine/Formats/SnapshotText.h"
#include "CommandLine/Input.h"
#include "CommandLine/InputFeed.h"
#include "CommandLine/OfflineServices.h"
#include "CommandLine/Output.h"
#include "CommandLine/ReplaceFile.h"
#include "LogGenerator/Ondrel/Reframing.h"
#include "Model/Replay.h"
#include "Model/Snapshot.h"
#include "Platform/Linux/LinuxPlatform.h"
#include "Recordings/OutputPath.h"
#include "Recordings/SnapshotFile.h"

namespace kestro {
namespace {

constexpr const char* kSnapshotText =
    R"(A snapshot holds the last five displays with a description and, for binary log channels, their
packets as a DLF log: what the window saves, in the same format.)";
constexpr const char* kSnapshotExamples =
    R"(  kestro-cli snapshot save drive.pcapng -o drive.kestro --description="drop at the tunnel"
  kestro-cli snapshot show drive.kestro
  kestro-cli snapshot export-dlf drive.kestro -o drive.dlf)";

constexpr const char* kSaveText =
    R"(The recording is replayed with a refresh every 2 s of its time, as `decode` does, and saved as if the
save button were pressed at its last message: all times in the snapshot are the recording's. An
existing file is replaced when the snapshot is complete.)";
constexpr const char* kSaveExample =
    R"(  kestro-cli snapshot save drive.pcapng -o drive.kestro --description="drop at the tunnel")";

constexpr const char* kShowExample = "  kestro-cli snapshot show drive.kestro | less";

constexpr const char* kExportText =
    R"(The DLF log is written as it was saved: of each history entry only the first packet frames, those
behind it have their type byte in front of their record. With --reframe these bytes (and the 2-byte
prefixes that some messages have) are left out, so that every packet frames; what is no packet even
so is named and left out, and the exit status is 3. An existing file is replaced.)";
constexpr const char* kExportExamples =
    R"(  kestro-cli snapshot export-dlf drive.kestro -o drive.dlf
  kestro-cli snapshot export-dlf drive.kestro -o drive.dlf --reframe)";

struct SnapshotOptions {
  InputOptions inputs;  ///< of a snapshot that is made
  std::string input;    ///< the snapshot that is read
  std::string output;
  std::string description;
  bool reframe = false;
  std::optional<LogPriority> shownLog;
};

/// Writes a whole file, unless it is one of those that were read; the exit status.
int writeFile(const SnapshotOptions& options, const Bytes& contents, ExitStatus status) {
  auto inputs = filesOf(options.inputs);
  if (!options.input.empty()) inputs.push_back(options.input);
  if (const auto checked = checkOutputIsNoInput(options.output, inputs); !checked) {
    return nothingDone(checked.error().message);
  }
  const auto written = replaceFile(
      options.output, {reinterpret_cast<const char*>(contents.data()), contents.size()});
  return written ? status : nothingDone(written.error().message);
}

Result<Dictionary> readSnapshot(const std::string& path) {
  const auto file = readFile(path, PropertyListLimits::snapshotFile().bytes);
  if (!file) return tl::unexpected(file.error());
  auto snapshot = parseSnapshot(*createPropertyListCoding(), *file);
  if (!snapshot) return failure(fmt::format("{}: {}", path, snapshot.error().message));
  return snapshot;
}

// --- save

/// What a generator would save at the end of the inputs.
int runSave(const SnapshotOptions& options) {
  auto feed = InputFeed::open(options.inputs, false);
  if (!feed) return feed.error();
  OfflineServices services(std::nullopt, options.shownLog);
  services.clock().setNow(createSystemClock()->now());  // for a recording without a message
  ReplayedInputs replayed(*feed, services, {}, [](const ReplayRefresh&) {});
  while (replayed.feedNext()) {
  }
  if (feed->status() == kExitNothingDone) return kExitNothingDone;
  Replay& replay = replayed.replay();
  replay.finish();
  Value contents;
  if (auto* generator = replay.generator()) {
    contents = generator->getSaveContentsFromState(replay.state());
  }
  const Snapshot snapshot(services.clock(), contents);
  const auto file = snapshot.file(services.propertyListCoding(), options.description);
  if (!file) return nothingDone(fmt::format("{}: {}", feed->name(), file.error().message));
  return writeFile(options, *file, feed->status());
}

// --- show

int runShow(const SnapshotOptions& options) {
  const auto snapshot = readSnapshot(options.input);
  if (!snapshot) return nothingDone(snapshot.error().message);
  Output output = Output::standardOutput();
  writeSnapshotText(*snapshot, [&output](std::string_view text) { output.write(text); });
  output.flush();
  if (output.failureMessage().empty()) return kExitDone;
  return nothingDone(output.failureMessage());
}

// --- export-dlf

int writeReframed(const SnapshotOptions& options, const Dictionary& snapshot, const Value& dlf) {
  const auto reframed = reframedDlf(dlf.bytes(), snapshot[kSnapshotData].array());
  if (!reframed) {
    return nothingDone(
        fmt::format("{}: its DLF log does not hold the packets of its history", options.input));
  }
  for (const ReframedDlf::Unframed& part : reframed->unframed) {
    complain(fmt::format("{}: entry {}: the last {} bytes are no packets and are left out",
                         options.input, part.entry, part.size));
  }
  return writeFile(options, reframed->dlf,
                   reframed->unframed.empty() ? kExitDone : kExitPartlyDone);
}

int runExport(const SnapshotOptions& options) {
  const auto snapshot = readSnapshot(options.input);
  if (!snapshot) return nothingDone(snapshot.error().message);
  const Value dlf = dlfOfSnapshot(*snapshot);
  if (dlf.isNull()) return nothingDone(fmt::format("{}: holds no DLF log", options.input));
  if (options.reframe) return writeReframed(options, *snapshot, dlf);
  return writeFile(options, Bytes(dlf.bytes().begin(), dlf.bytes().end()), kExitDone);
}

// --- Options

using SharedOptions = std::shared_ptr<SnapshotOptions>;

OptionRow snapshotArgument(const SharedOptions& options) {
  return {.name = "FILE", .help = "The snapshot", .target = &options->input, .isRequired = true};
}

OptionRow outputOption(const SharedOptions& options, const char* what) {
  return {.name = "-o,--output",
          .value = "FILE",
          .help = what,
          .target = &options->output,
          .isRequired = true};
}

CommandRow saveAction(const SharedOptions& options) {
  return {
      .name = "save",
      .help = "Save the end of recordings as a snapshot",
      .options = withInputRows(options->inputs, {outputOption(options, "The snapshot to write"),
                                                 {.name = "--description",
                                                  .value = "TEXT",
                                                  .help = "What the snapshot shows; may be empty",
                                                  .target = &options->description,
                                                  .isRequired = true,
                                                  .impliedValue = ""},
                                                 shownLogOption(options->shownLog)}),
      .sections = {{.text = kSaveText}, inputsHelp(), {.title = "Example", .text = kSaveExample}},
      .run = [options] { return runSave(*options); }};
}

CommandRow showAction(const SharedOptions& options) {
  return {.name = "show",
          .help = "Show what a snapshot holds",
          .options = {snapshotArgument(options)},
          .sections = {{.title = "Example", .text = kShowExample}},
          .run = [options] { return runShow(*options); }};
}

CommandRow exportAction(const SharedOptions& options) {
  return {.name = "export-dlf",
          .help = "Write a snapshot's packets as a DLF log",
          .options = {snapshotArgument(options),
                      outputOption(options, "The DLF log to write"),
                      {.name = "--reframe",
                       .help = "Leave out the type bytes between the packets",
                       .target = &options->reframe}},
          .sections = {{.text = kExportText}, {.title = "Examples", .text = kExportExamples}},
          .run = [options] { return runExport(*options); }};
}

}  // namespace

CommandRow snapshotCommand() {
  const auto options = std::make_shared<SnapshotOptions>();
  return {.name = "snapshot",
          .help = "Save, show and export snapshots",
          .commands = {saveAction(options), showAction(options), exportAction(options)},
          .sections = {{.text = kSnapshotText},
                       {.title = "Examples", .text = kSnapshotExamples},
                       {.text = "`kestro-cli snapshot ACTION --help` explains an action."}}};
}

}  // namespace kestro
