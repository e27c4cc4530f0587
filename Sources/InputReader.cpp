// SPDX-License-Identifier: MIT
#include "Sources/InputReader.h"

#include <utility>
#include <variant>

#include "Sources/DriveTestLog.h"

namespace kestro {
namespace {

using OpenedInput = Result<std::unique_ptr<InputReader>>;

constexpr std::string_view kRecordingKind = "capture";
constexpr std::string_view kSimulationKind = "simulation";
constexpr std::string_view kDriveTestKind = "drive-test";

/// A recording, read as it is.
class RecordingInput final : public InputReader {
 public:
  explicit RecordingInput(std::unique_ptr<RecordingReader> reader) : _reader(std::move(reader)) {}

  [[nodiscard]] std::string_view form() const noexcept override {
    return nameOfForm(_reader->form());
  }
  [[nodiscard]] std::string_view technology() const noexcept override {
    const auto known = _reader->technologies();
    return known.empty() ? std::string_view() : known.front();
  }
  [[nodiscard]] bool mayChangeTechnology() const noexcept override {
    return _reader->form() == RecordingForm::Pcapng;
  }
  [[nodiscard]] bool timesGoUp() const noexcept override { return false; }

  [[nodiscard]] Result<std::optional<InputMessage>> next() override {
    const auto message = _reader->next();
    if (!message) return tl::unexpected(message.error());
    if (!message->has_value()) return std::nullopt;
    const RecordedMessage& recorded = **message;
    return InputMessage{.time = recorded.time,
                        .technology = recorded.technology,
                        .bytes = recorded.bytes,
                        .originalLength = recorded.originalLength,
                        .comments = recorded.comments,
                        .madeUp = _reader->madeUp()};
  }

  [[nodiscard]] std::span<const std::string> closingNotes() const noexcept override {
    return _reader->closingNotes();
  }
  [[nodiscard]] std::uint64_t passedOverCount() const noexcept override {
    return _reader->passedOverCount();
  }
  [[nodiscard]] std::optional<double> fractionRead() const noexcept override {
    return _reader->fractionRead();
  }

 private:
  std::unique_ptr<RecordingReader> _reader;
};

/// What the telephony server would play, without waiting for its times.
class SourceInput final : public InputReader {
 public:
  struct Traits {
    std::string_view form;
    bool mayChangeTechnology = false;
    bool timesGoUp = false;
  };

  SourceInput(std::unique_ptr<LogSource> source, const Traits& traits, const Clock& clock)
      : _source(std::move(source)), _traits(traits), _clock(clock) {}

  [[nodiscard]] std::string_view form() const noexcept override { return _traits.form; }
  [[nodiscard]] std::string_view technology() const noexcept override {
    return _source->technology();
  }
  [[nodiscard]] bool mayChangeTechnology() const noexcept override {
    return _traits.mayChangeTechnology;
  }
  [[nodiscard]] bool timesGoUp() const noexcept override { return _traits.timesGoUp; }

  [[nodiscard]] Result<std::optional<InputMessage>> next() override {
    while (true) {
      const auto step = _source->next();
      if (!step) return tl::unexpected(step.error());
      const auto* event = std::get_if<SourceEvent>(&*step);
      if (event == nullptr) return std::nullopt;
      if (event->message.empty()) continue;
      return InputMessage{.time = event->moment ? *event->moment : _clock.now(),
                          .technology = event->technology,
                          .bytes = event->message,
                          .originalLength = event->message.size(),
                          .comments = event->comments,
                          .madeUp = _source->madeUp()};
    }
  }

  [[nodiscard]] std::optional<double> fractionRead() const noexcept override {
    return _source->fractionRead();
  }

 private:
  std::unique_ptr<LogSource> _source;
  Traits _traits;
  const Clock& _clock;
};

OpenedInput readerOf(Result<std::unique_ptr<LogSource>> source, const SourceInput::Traits& traits,
                     const Clock& clock) {
  if (!source) return tl::unexpected(source.error());
  return std::make_unique<SourceInput>(*std::move(source), traits, clock);
}

/// What a drive-test log is to be made of, if nothing else was asked for: what its rows are.
std::string_view orAutomatic(std::string_view technology) {
  return technology.empty() ? kAutomaticTechnology : technology;
}

OpenedInput openDriveTestInput(RecordedFile file, const SourceRequest& input,
                               const SourceServices& services, const SourceReporter& report) {
  const auto technology = orAutomatic(input.technology);
  return readerOf(
      openDriveTest(std::move(file), technology, services, report),
      {.form = "drive-test log", .mayChangeTechnology = technology == kAutomaticTechnology},
      services.clock);
}

OpenedInput openFile(const SourceRequest& input, const SourceServices& services,
                     const SourceReporter& report) {
  auto file = RecordedFile::open(input.argument);
  if (!file) return tl::unexpected(file.error());
  if (input.kind == kDriveTestKind) {
    return openDriveTestInput(*std::move(file), input, services, report);
  }
  const auto head = file->ahead(kDriveTestHeadSize);
  if (!head) return tl::unexpected(head.error());
  if (isDriveTestLog(*head)) return openDriveTestInput(*std::move(file), input, services, report);
  auto reader = openRecording(*std::move(file), {.coding = services.propertyListCoding,
                                                 .technologiesOfCode = services.technologiesOfCode,
                                                 .technology = technologyNamed(input.technology)});
  if (!reader) return tl::unexpected(reader.error());
  return std::make_unique<RecordingInput>(*std::move(reader));
}

}  // namespace

Result<SourceRequest> parseInput(std::string_view text, std::string_view technology) {
  const auto colon = text.find(':');
  const auto kind = text.substr(0, colon);
  if (colon == std::string_view::npos || sourceKindNamed(kind) == nullptr) {
    return SourceRequest{std::string(kRecordingKind), std::string(text), technology};
  }
  if (kind == kDriveTestKind) return parseSource(text, orAutomatic(technology));
  // What an input says itself is not changed, but narrowed.
  const bool saysIt = kind == kSimulationKind && colon + 1 < text.size();
  return parseSource(text, saysIt || technology == kAutomaticTechnology ? "" : technology);
}

Result<std::unique_ptr<InputReader>> openInput(const SourceRequest& input,
                                               const SourceServices& services,
                                               const SourceReporter& report) {
  if (input.kind == kRecordingKind || input.kind == kDriveTestKind) {
    return openFile(input, services, report);
  }
  const auto* kind = sourceKindNamed(input.kind);
  return readerOf(openSource(input, services, report),
                  {.form = kind == nullptr ? "" : kind->name, .timesGoUp = true}, services.clock);
}

}  // namespace kestro
