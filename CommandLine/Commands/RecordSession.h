// SPDX-License-Identifier: MIT
// Recording what arrives on the log channel.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Model/LogChannelClient.h"
#include "Platform/LogSourceState.h"
#include "Platform/MainQueue.h"
#include "Platform/Platform.h"
#include "Platform/TelephonyProtocol.h"
#include "Recordings/RecordingWriter.h"

namespace kestro {

/// Writes every message of a log channel to a recording, undecoded, of the form that its name asks
/// for (`createRecording`). A technology that cannot be recorded ends it. A lost connection, and
/// that it is back, are notes in it. Main thread only.
class RecordSession : private LogChannelUser {
 public:
  /// A remark for the person who records: that it connects, records, or leaves a message out.
  using Remark = std::function<void(const std::string& text)>;

  /// `path` is the first file's; no file may be one of `inputs`. `failed` is called once when the
  /// recording cannot be written; after that nothing is recorded. `platform` must outlive the
  /// session.
  RecordSession(Platform& platform, std::string path, std::vector<std::string> inputs,
                Remark remark, std::function<void(const std::string& reason)> failed);

  void start();
  /// To be called before `start`: messages get the times that the source says, as far as the server
  /// tells them, instead of those at which they arrive.
  void useSourceTimes() noexcept { _usesSourceTimes = true; }
  /// Adds a line to the recording, as a comment of the next message.
  void addNote(std::string_view line);
  /// What remarks call the server; its default name unless set.
  void setServerName(std::string name) { _serverName = std::move(name); }
  /// Remarks every minute from now on how much has come.
  void tellEveryMinute();
  /// Writes the notes that no message has followed, and records nothing from now on: what still
  /// comes while the program ends is in neither the file nor the summary.
  void stop();

  /// "123 messages, 4567 bytes, 0 dropped, in drive.pcap", and how often the connection was lost,
  /// for how long and how many messages, if it was; absent when no file was begun.
  [[nodiscard]] std::optional<std::string> summary() const;

  /// Whether messages are missing, as far as is known.
  [[nodiscard]] bool isIncomplete() const noexcept { return _losses.count > 0; }

 private:
  void technologyAnswered(std::string_view technology) override;
  [[nodiscard]] std::optional<Dictionary> startCommand() override;
  void messageArrived(ByteView message) override;
  void connectionChanged(bool isConnected) override;
  void sourceTold(const LogSourceState& source) override;
  void connectionFailed(const ConnectionProblem& problem) override;
  void channelFollowed(std::chrono::microseconds gap, std::optional<std::uint64_t> missed) override;

  /// Connections that were lost, with messages.
  struct Losses {
    unsigned count = 0;
    std::chrono::microseconds time{0};
    std::uint64_t messages = 0;
    bool areMore = false;  ///< than those messages; nobody knows how many
  };

  [[nodiscard]] std::string lossesText() const;
  [[nodiscard]] Result<void> openFile(std::string_view technology);
  [[nodiscard]] Moment timeOfMessage() const;
  void addGap(std::chrono::microseconds gap, std::optional<std::uint64_t> missed, bool isOver);
  void fail(const std::string& reason);
  void tellProgress();

  Platform& _platform;
  std::string _path;
  std::vector<std::string> _inputs;
  Remark _remark;
  std::function<void(const std::string& reason)> _failed;
  bool _usesSourceTimes = false;
  std::string_view _madeUp;  ///< what of the messages is made up, as the server says
  std::unique_ptr<RecordingWriter> _recording;
  std::uint64_t _byteCount = 0;
  std::unique_ptr<Timer> _minutes;
  std::uint64_t _toldCount = 0;  ///< of messages, a minute ago
  Losses _losses;
  std::string _serverName{kDefaultServerName};
  std::optional<ConnectionProblem> _toldProblem;
  bool _isOver = false;  ///< stopped or failed: nothing is recorded any more
  LogChannelClient _client;
};

}  // namespace kestro
