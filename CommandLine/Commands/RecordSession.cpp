// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/RecordSession.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <utility>

#include "Platform/Clock.h"
#include "Platform/TelephonyProtocol.h"
#include "Recordings/OutputPath.h"
#include "Recordings/StorableValue.h"
#include "Sources/LogSource.h"

namespace kestro {
namespace {

constexpr const char* kConnectingRemark = "connecting...";
constexpr const char* kLostNote = "connection lost";

/// What of the messages is made up, for the recording: of a drive-test log only a part is.
std::string_view madeUpBy(const LogSourceState& source) {
  if (!source.isSimulated.value_or(false)) return {};
  return source.kind == kMadeUpFromDriveTest ? kMadeUpFromDriveTest : kMadeUpBySimulation;
}

std::string countOfMissed(std::optional<std::uint64_t> missed) {
  return missed ? fmt::format("{} messages", *missed) : "an unknown number of messages";
}

std::string namesOf(const std::vector<std::string>& files) {
  std::vector<std::string> names(files.size());
  std::ranges::transform(files, names.begin(), outputName);
  return fmt::format("{}", fmt::join(names, ", "));
}

}  // namespace

RecordSession::RecordSession(Platform& platform, std::string path, std::vector<std::string> inputs,
                             Remark remark, std::function<void(const std::string& reason)> failed)
    : _platform(platform),
      _path(std::move(path)),
      _inputs(std::move(inputs)),
      _remark(std::move(remark)),
      _failed(std::move(failed)),
      _client(platform, *this, ChannelWatch::ByClient) {}

void RecordSession::start() {
  _client.start();
  if (!_client.isConnected()) _remark(kConnectingRemark);
}

void RecordSession::tellEveryMinute() {
  _minutes =
      _platform.mainQueue().scheduleRepeating(std::chrono::minutes(1), [this] { tellProgress(); });
}

void RecordSession::tellProgress() {
  if (_isOver || !_recording) return;
  const std::uint64_t count = _recording->messageCount();
  const bool isSilent = std::exchange(_toldCount, count) == count;
  _remark(fmt::format("so far {} messages, {} bytes{}", count, _byteCount,
                      isSilent ? "; none in the last minute" : ""));
}

void RecordSession::stop() {
  if (_isOver) return;
  if (const auto gap = _client.gap()) addGap(*gap, std::nullopt, false);
  if (_recording) {
    if (const auto finished = _recording->finish(); !finished) fail(finished.error().message);
  }
  _isOver = true;
}

void RecordSession::addNote(std::string_view line) {
  if (_isOver || line.empty()) return;
  if (!_recording) return _remark("the recording has not begun: the note is dropped");
  if (!_recording->addNote(storableText(line))) {
    _remark("the note is dropped: the recording has no room for it");
  }
}

std::optional<std::string> RecordSession::summary() const {
  if (!_recording) return std::nullopt;
  return fmt::format("{} messages, {} bytes, {} dropped, in {}{}", _recording->messageCount(),
                     _byteCount, _recording->leftOutCount(), namesOf(_recording->files()),
                     lossesText());
}

std::string RecordSession::lossesText() const {
  if (!isIncomplete()) return {};
  std::string missed = fmt::format("{} messages", _losses.messages);
  if (_losses.areMore) {
    missed = _losses.messages == 0 ? "an unknown number of messages" : "at least " + missed;
  }
  return fmt::format("; lost the connection {} {}, for at most {:.1f} s, and {}", _losses.count,
                     _losses.count == 1 ? "time" : "times",
                     std::chrono::duration<double>(_losses.time).count(), missed);
}

void RecordSession::channelFollowed(std::chrono::microseconds gap,
                                    std::optional<std::uint64_t> missed) {
  if (!_isOver && missed != 0U) addGap(gap, missed, true);
}

void RecordSession::addGap(std::chrono::microseconds gap, std::optional<std::uint64_t> missed,
                           bool isOver) {
  ++_losses.count;
  _losses.time += gap;
  _losses.messages += missed.value_or(0);
  _losses.areMore |= !missed;
  if (!_recording) return;
  // Where there is no room for it, the last line tells of it all the same.
  static_cast<void>(_recording->addNote(kLostNote));
  if (!isOver) return;
  static_cast<void>(_recording->addNote(
      fmt::format("connection back after at most {:.1f} s; {} were missed",
                  std::chrono::duration<double>(gap).count(), countOfMissed(missed))));
}

void RecordSession::sourceTold(const LogSourceState& source) {
  _madeUp = madeUpBy(source);
  if (_isOver || !_recording) return;
  if (const auto told = _recording->setMadeUp(_madeUp); !told) fail(told.error().message);
}

void RecordSession::technologyAnswered(std::string_view technology) {
  if (_isOver) return;
  if (const auto opened = openFile(technology); !opened) return fail(opened.error().message);
  _remark(fmt::format("recording {} to {}", technology, outputName(_recording->files().back())));
}

/// Without lists of codes everything is streamed.
std::optional<Dictionary> RecordSession::startCommand() {
  if (_isOver || !_recording) return std::nullopt;
  Dictionary command{{kTelephonySetState, kTelephonyStreaming}};
  if (_usesSourceTimes) command.set(kTelephonyTimes, Value::boolean(true));
  return command;
}

Result<void> RecordSession::openFile(std::string_view technology) {
  if (_recording) return _recording->setTechnology(technology);
  auto created = createRecording(_path, technology, _madeUp, _inputs);
  if (!created) return tl::unexpected(created.error());
  _recording = *std::move(created);
  return {};
}

Moment RecordSession::timeOfMessage() const {
  const auto now = _platform.clock().now();
  return _usesSourceTimes ? _client.sourceTime().value_or(now) : now;
}

void RecordSession::messageArrived(ByteView message) {
  if (_isOver) return;
  const std::uint64_t leftOutBefore = _recording->leftOutCount();
  if (const auto written = _recording->write(timeOfMessage(), message); !written) {
    return fail(written.error().message);
  }
  if (_recording->leftOutCount() == leftOutBefore) {
    _byteCount += message.size();
  } else if (leftOutBefore == 0) {
    _remark(fmt::format("dropped a message of {} bytes, too long for a capture; more are counted",
                        message.size()));
  }
}

void RecordSession::connectionChanged(bool isConnected) {
  if (isConnected) _toldProblem.reset();
  if (!isConnected && !_isOver) _remark(kConnectingRemark);
}

void RecordSession::connectionFailed(const ConnectionProblem& problem) {
  if (_isOver || std::exchange(_toldProblem, problem) == problem) return;
  _remark(problemText(problem, _serverName));
}

void RecordSession::fail(const std::string& reason) {
  if (std::exchange(_isOver, true)) return;
  _failed(reason);
}

}  // namespace kestro
