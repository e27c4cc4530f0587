// SPDX-License-Identifier: MIT
#include "Model/LogChannelClient.h"

#include <algorithm>
#include <utility>

#include "Platform/MessagePort.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyProtocol.h"

namespace kestro {

LogChannelClient::LogChannelClient(Platform& platform, LogChannelUser& user, ChannelWatch watch)
    : _platform(platform),
      _user(user),
      _watch(watch),
      _ports(platform, handlers()),
      _self(std::make_shared<LogChannelClient*>(this)) {}

LogChannelHandlers LogChannelClient::handlers() {
  LogChannelHandlers result{.received = [this](ByteView message) { _user.messageArrived(message); },
                            .lost = [this] { restart(); },
                            .notified = [this] { serverNotified(); }};
  result.sourceTold = [this](const LogSourceState& source) { _user.sourceTold(source); };
  if (_watch == ChannelWatch::ByClient) {
    result.followed = [this](std::optional<std::uint64_t> missed) { followed(missed); };
  }
  return result;
}

void LogChannelClient::check() {
  if (_ports.check()) _seen = _platform.clock().now();
}

void LogChannelClient::followed(std::optional<std::uint64_t> missed) {
  const Moment now = _platform.clock().now();
  const auto gap = now - std::exchange(_seen, now).value_or(now);
  _user.channelFollowed(std::max(gap, std::chrono::microseconds(0)), missed);
}

std::optional<std::chrono::microseconds> LogChannelClient::gap() const {
  if (_isRunning || !_seen) return std::nullopt;
  return std::max(_platform.clock().now() - *_seen, std::chrono::microseconds(0));
}

void LogChannelClient::start() {
  if (_isRunning) return;
  const auto problem = tryToConnect();
  if (problem) {
    stopPorts();
    scheduleRetry();
  }
  tellConnection();
  if (problem) _user.connectionFailed(*problem);
}

void LogChannelClient::restart() {
  stopPorts();
  start();
}

void LogChannelClient::close() {
  stopPorts();
  tellConnection();
}

void LogChannelClient::stopPorts() {
  _user.channelStops();
  _isRunning = false;
  _checkTimer.reset();
  _ports.close();
}

std::optional<ConnectionProblem> LogChannelClient::tryToConnect() {
  if (!openPorts()) {
    logError("Could not create the ports necessary");
    return _ports.problem();
  }
  _technology.clear();
  requestTechnology();
  if (auto problem = sendStartCommand()) return problem;
  _isRunning = true;
  _seen = _platform.clock().now();
  if (_watch == ChannelWatch::ByClient) {
    _checkTimer =
        _platform.mainQueue().scheduleRepeating(kChannelCheckInterval, [this] { check(); });
  }
  _user.channelStarted();
  return std::nullopt;
}

void LogChannelClient::scheduleRetry() {
  _platform.mainQueue().postAfter(kRetryDelay,
                                  [weak = std::weak_ptr(_self), kept = _user.keptByRetry()] {
                                    if (const auto client = weak.lock()) (*client)->start();
                                  });
}

void LogChannelClient::requestTechnology() {
  const Dictionary command{{kTelephonyGetTechnology, kTelephonyGetTechnology}};
  const auto request = _platform.propertyListCoding().xml(command);
  if (!request) {
    logError(" Could not generate GetTechnology command; cannot configure");
    return;
  }
  const RemotePort::Reply reply = _ports.request(*request);
  if (reply.error != SendError::None) {
    _platform.systemLog().log(LogPriority::Error,
                              " ***** Could not send the GetTechnology command (got error={})",
                              static_cast<int>(reply.error));
    return;
  }
  if (!reply.data) {
    logError(" ***** No response to GetTechnology; cannot configure");
    return;
  }
  readTechnology(*reply.data);
}

void LogChannelClient::readTechnology(ByteView reply) {
  const Result<Value> parsed = _platform.propertyListCoding().parse(reply);
  if (!parsed) {
    logError(" ***** Could not parse reply to GetTechnology; cannot configure");
    return;
  }
  const Value technology = parsed->dictionary()[kTelephonyGetTechnology];
  if (technology.isNull()) {
    logError(" ***** Reply to GetTechnology had no answer; cannot configure");
    return;
  }
  _technology = technology.text();
  _user.technologyAnswered(technology.text());
}

std::optional<ConnectionProblem> LogChannelClient::sendStartCommand() {
  using Kind = ConnectionProblem::Kind;
  const std::optional<Dictionary> command = _user.startCommand();
  if (!command && !_technology.empty()) return ConnectionProblem{Kind::Technology, _technology};
  const ConnectionProblem noAnswer{Kind::NoAnswer};
  if (!command) return noAnswer;
  const auto message = _platform.propertyListCoding().xml(*command);
  if (!message) {
    logError(" Could not generate PLIST");
    return noAnswer;
  }
  const SendError error = _ports.send(*message);
  if (error == SendError::None) return std::nullopt;
  _platform.systemLog().log(LogPriority::Error,
                            " ***** Could not send the START command (got error={})",
                            static_cast<int>(error));
  return noAnswer;
}

void LogChannelClient::serverNotified() {
  if (_watch == ChannelWatch::ByClient) return check();
  _user.serverNotified();
}

void LogChannelClient::tellConnection() {
  const bool isConnectedNow = isConnected();
  if (std::exchange(_toldConnected, isConnectedNow) == isConnectedNow) return;
  _user.connectionChanged(isConnectedNow);
}

void LogChannelClient::logError(std::string_view line) {
  _platform.systemLog().write(LogPriority::Error, line);
}

}  // namespace kestro
