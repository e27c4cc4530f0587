// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/RecordSession.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <utility>

#include "CommandLine/Commands/WatchSession.h"
#include "Platform/Clock.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {

/// Takes the messages of any technology as they are.
class RecordSession::Generator : public LogGenerator {
 public:
  Generator(Platform& platform, std::weak_ptr<RecordSession*> session)
      : LogGenerator(platform), _session(std::move(session)) {}

  void updateStateWithData(Dictionary&, ByteView data) override {
    if (const auto session = _session.lock()) (*session)->recordMessage(data);
  }
  Value generateLogUsingState(Dictionary&) override { return {}; }
  /// Without lists of codes everything is streamed.
  [[nodiscard]] Dictionary getStartCommand() const override {
    return {{kTelephonySetState, kTelephonyStreaming}};
  }
  [[nodiscard]] Array getSaveContentsFromState(const Dictionary&) override { return {}; }

 private:
  std::weak_ptr<RecordSession*> _session;
};

RecordSession::RecordSession(Platform& platform, std::string path, Remark remark,
                             std::function<void(const std::string& reason)> failed)
    : _platform(platform),
      _path(std::move(path)),
      _remark(std::move(remark)),
      _failed(std::move(failed)),
      _self(std::make_shared<RecordSession*>(this)),
      _model(KestroModel::create(
          platform, [] {},
          [weak = std::weak_ptr(_self)](Platform&, std::string_view technology) {
            const auto session = weak.lock();
            return session ? (*session)->recordTechnology(technology) : nullptr;
          })) {}

void RecordSession::start() {
  _model->restartMonitor();
  _connectionTimer = _platform.mainQueue().scheduleRepeating(kConnectionCheckInterval,
                                                             [this] { checkConnection(); });
  checkConnection();
}

void RecordSession::stop() { _isOver = true; }

std::optional<std::string> RecordSession::summary() const {
  if (!_recording) return std::nullopt;
  return fmt::format("{} messages, {} bytes, {} dropped, in {}", _recording->messageCount(),
                     _byteCount, _recording->leftOutCount(), fmt::join(_recording->files(), ", "));
}

std::unique_ptr<LogGenerator> RecordSession::recordTechnology(std::string_view technology) {
  if (_isOver) return nullptr;
  if (const auto opened = openFile(technology); !opened) {
    fail(opened.error().message);
    return nullptr;
  }
  _remark(fmt::format("recording {} to {}", technology, _recording->files().back()));
  return std::make_unique<Generator>(_platform, _self);
}

Result<void> RecordSession::openFile(std::string_view technology) {
  if (_recording) return _recording->setTechnology(technology);
  auto created = PcapRecording::create(_path, technology);
  if (!created) return tl::unexpected(created.error());
  _recording = *std::move(created);
  return {};
}

void RecordSession::recordMessage(ByteView message) {
  if (_isOver) return;
  const std::uint64_t leftOutBefore = _recording->leftOutCount();
  if (const auto written = _recording->write(_platform.clock().now(), message); !written) {
    return fail(written.error().message);
  }
  if (_recording->leftOutCount() == leftOutBefore) {
    _byteCount += message.size();
  } else if (leftOutBefore == 0) {
    _remark(fmt::format("dropped a message of {} bytes, too long for a capture; more are counted",
                        message.size()));
  }
}

void RecordSession::checkConnection() {
  const bool isConnected = _model->isConnected();
  if (!isConnected && _wasConnected) _remark("connecting...");
  _wasConnected = isConnected;
}

void RecordSession::fail(const std::string& reason) {
  if (std::exchange(_isOver, true)) return;
  _failed(reason);
}

}  // namespace kestro
