// SPDX-License-Identifier: MIT
// The small services of the virtual platform: they record what they are told and answer as
// scripted.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "Platform/Bundle.h"
#include "Platform/DeviceRoot.h"
#include "Platform/InputStream.h"
#include "Platform/Preferences.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyService.h"
#include "Platform/TextSink.h"
#include "Platform/Uuids.h"

namespace kestro {

/// Keeps every accepted line, in order.
class RecordingSystemLog : public SystemLog {
 public:
  struct Line {
    LogPriority priority;
    std::string text;
    bool operator==(const Line&) const = default;
    /// "3 text", for the failures of tests.
    friend std::ostream& operator<<(std::ostream& stream, const Line& line) {
      return stream << static_cast<int>(line.priority) << ' ' << line.text;
    }
  };

  RecordingSystemLog() : SystemLog(LogPriority::Debug) {}

  [[nodiscard]] const std::vector<Line>& lines() const noexcept { return _lines; }
  /// The lines since the last call, which are forgotten.
  [[nodiscard]] std::vector<Line> take() { return std::exchange(_lines, {}); }

 protected:
  void writeLine(LogPriority priority, std::string_view line) override {
    _lines.push_back({priority, std::string(line)});
  }

 private:
  std::vector<Line> _lines;
};

/// Keeps every line, in order.
class RecordingTextSink : public TextSink {
 public:
  void writeLine(std::string_view line) override { _lines.emplace_back(line); }
  [[nodiscard]] const std::vector<std::string>& lines() const noexcept { return _lines; }

 private:
  std::vector<std::string> _lines;
};

/// Resources, version and build date as set.
class VirtualBundle : public Bundle {
 public:
  [[nodiscard]] std::vector<std::string> resourcesOfType(std::string_view extension) const override;
  [[nodiscard]] std::optional<Bytes> resource(std::string_view name,
                                              std::string_view extension) const override;
  [[nodiscard]] std::optional<std::string> version() const override { return _version; }
  [[nodiscard]] std::string buildDate() const override { return _buildDate; }

  /// `path` with its extension, for instance "LTE.plist".
  void setResource(std::string path, Bytes contents) {
    _resources.insert_or_assign(std::move(path), std::move(contents));
  }
  void setVersion(std::optional<std::string> version) { _version = std::move(version); }
  void setBuildDate(std::string date) { _buildDate = std::move(date); }

 private:
  std::map<std::string, Bytes, std::less<>> _resources;
  std::optional<std::string> _version = "0.0";
  std::string _buildDate = "Mar  4 2012 13:05:09";
};

/// Preferences in memory; synchronisations and notifications are kept as "verb domain key" lines.
class VirtualPreferences : public Preferences {
 public:
  [[nodiscard]] std::optional<bool> boolean(std::string_view domain,
                                            std::string_view key) const override;
  void setBoolean(std::string_view domain, std::string_view key, bool value) override;
  void synchronize(std::string_view domain) override;
  void notifyChanged(std::string_view domain, std::string_view key) override;

  [[nodiscard]] const std::vector<std::string>& events() const noexcept { return _events; }

 private:
  std::map<std::string, bool, std::less<>> _values;
  std::vector<std::string> _events;
};

/// Files in memory.
class VirtualDeviceRoot : public DeviceRoot {
 public:
  [[nodiscard]] bool exists(std::string_view devicePath) const override {
    return _files.contains(devicePath);
  }
  [[nodiscard]] std::string hostPath(std::string_view devicePath) const override {
    return "/device" + std::string(devicePath);
  }
  [[nodiscard]] Result<void> write(std::string_view devicePath, ByteView contents) override;

  /// Every write fails with this message until it is taken back.
  void setWriteFailure(std::optional<std::string> message) { _failure = std::move(message); }
  [[nodiscard]] std::map<std::string, Bytes, std::less<>>& files() noexcept { return _files; }

 private:
  std::map<std::string, Bytes, std::less<>> _files;
  std::optional<std::string> _failure;
};

/// Counts upwards: "00000000-0000-0000-0000-000000000001" comes first.
class VirtualUuids : public Uuids {
 public:
  [[nodiscard]] std::optional<std::string> create() override;
  void setExhausted(bool exhausted) noexcept { _exhausted = exhausted; }

 private:
  unsigned _last = 0;
  bool _exhausted = false;
};

/// A telephony server that answers as scripted.
class VirtualTelephonyService : public TelephonyService {
 public:
  // NOLINTNEXTLINE(bugprone-reserved-identifier,readability-identifier-naming)
  [[nodiscard]] std::unique_ptr<TqServerConnection> _TqServerConnectionCreate(
      std::function<void()> notificationHandler) override;
  // NOLINTNEXTLINE(bugprone-reserved-identifier,readability-identifier-naming)
  [[nodiscard]] LogChannelReply _TqServerConnectionNetworkMonitorCreateLogChannel(
      TqServerConnection& connection, std::string_view localPortName) override;
  [[nodiscard]] LogChannelReply createLogChannelAfter(TqServerConnection& connection,
                                                      std::string_view localPortName,
                                                      std::string_view previousPortName) override;
  void setSourceHandler(std::function<void(const LogSourceState&)> handler) override {
    _sourceHandler = std::move(handler);
  }
  void cancelNotifications() override { _notificationHandler = {}; }

  void setReachable(bool reachable) noexcept { _reachable = reachable; }
  /// Answers the next channel requests; given the name of the client's local port.
  void setChannelHandler(std::function<LogChannelReply(std::string_view)> handler) {
    _channelHandler = std::move(handler);
  }
  /// Notifies whoever is registered.
  void notify() const {
    if (const auto handler = _notificationHandler) handler();
  }
  /// Notifies whoever is registered that the source has changed.
  void notifySource(const LogSourceState& state) const {
    if (const auto handler = _sourceHandler; handler && _notificationHandler) handler(state);
    notify();
  }
  /// The previous channels' ports that channels were asked for after, in order.
  [[nodiscard]] const std::vector<std::string>& previousPorts() const noexcept {
    return _previousPorts;
  }
  [[nodiscard]] bool hasRegistration() const noexcept { return bool(_notificationHandler); }

 private:
  bool _reachable = true;
  std::function<void()> _notificationHandler;
  std::function<LogChannelReply(std::string_view)> _channelHandler;
  std::function<void(const LogSourceState&)> _sourceHandler;
  std::vector<std::string> _previousPorts;
};

/// Streams that a program feeds by hand.
class VirtualInputStreams : public InputStreams {
 public:
  [[nodiscard]] Result<std::unique_ptr<InputStream>> open(
      std::string_view path, std::function<void(ByteView)> received,
      std::function<void(std::string_view reason)> ended) override;

  /// Whether `path` can be opened; nothing can at first.
  void allow(std::string path) { _allowed = std::move(path); }
  [[nodiscard]] bool isOpen() const noexcept { return !_open.expired(); }
  void receive(ByteView bytes) const;
  void end(std::string_view reason) const;

 private:
  struct Handlers {
    std::function<void(ByteView)> received;
    std::function<void(std::string_view)> ended;
  };
  class Stream;
  std::string _allowed;
  std::weak_ptr<Handlers> _open;
};

/// Passes everything on to a real coding, or fails as asked.
class ScriptedPropertyListCoding : public PropertyListCoding {
 public:
  explicit ScriptedPropertyListCoding(const PropertyListCoding& real) : _real(real) {}

  [[nodiscard]] Result<Value> parse(ByteView bytes,
                                    const PropertyListLimits& limits) const override {
    return _real.parse(bytes, limits);
  }
  [[nodiscard]] std::optional<Bytes> xml(const Value& value) const override {
    return _failsFor && _failsFor(value) ? std::nullopt : _real.xml(value);
  }
  [[nodiscard]] std::optional<Bytes> binary(const Value& value) const override {
    return _failsFor && _failsFor(value) ? std::nullopt : _real.binary(value);
  }

  /// Serialisation fails for the values that `predicate` accepts.
  void failFor(std::function<bool(const Value&)> predicate) { _failsFor = std::move(predicate); }

 private:
  const PropertyListCoding& _real;
  std::function<bool(const Value&)> _failsFor;
};

}  // namespace kestro
