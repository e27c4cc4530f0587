// SPDX-License-Identifier: MIT
#include "Platform/Linux/SystemBus.h"

#include <QDBusError>
#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <mutex>
#include <thread>
#include <utility>

#include "Platform/Linux/LinuxPlatform.h"

namespace kestro {
namespace {

constexpr const char* kUsualAddress = "unix:path=/run/dbus/system_bus_socket";

// The bus library asks the environment once, and remembers the answer for ever.
QString systemBusAddress() {
  const char* address = std::getenv("DBUS_SYSTEM_BUS_ADDRESS");
  const bool isGiven = address != nullptr && address[0] != '\0';
  return QString::fromLocal8Bit(isGiven ? address : kUsualAddress);
}

/// Attempts that are not over. A thread in the bus library may never come back from one.
std::atomic<int>& attempts() {
  static std::atomic<int> count{0};
  return count;
}

QString nextName() {
  static std::atomic<int> count{0};
  return QStringLiteral("org.kestro.SystemBus%1").arg(++count);
}

}  // namespace

struct SystemBusConnector::Outcome {
  std::mutex mutex;
  bool hasEnded = false;
  bool isWanted = true;
  std::optional<QDBusConnection> connection;
  std::string reason;
};

SystemBusConnector::SystemBusConnector()
    : _name(nextName()), _outcome(std::make_shared<Outcome>()) {
  ++attempts();
  std::thread([outcome = _outcome, name = _name, address = systemBusAddress()] {
    QDBusConnection connection = QDBusConnection::connectToBus(address, name);
    --attempts();
    const std::scoped_lock lock(outcome->mutex);
    outcome->hasEnded = true;
    if (!outcome->isWanted) {
      QDBusConnection::disconnectFromBus(name);
    } else if (connection.isConnected()) {
      outcome->connection = connection;
    } else {
      outcome->reason = connection.lastError().message().toStdString();
    }
  }).detach();
}

void endProcess(int status) {
  if (attempts() > 0) {
    static_cast<void>(std::fflush(nullptr));
    std::_Exit(status);
  }
  std::exit(status);
}

SystemBusConnector::~SystemBusConnector() {
  const std::scoped_lock lock(_outcome->mutex);
  _outcome->isWanted = false;
  if (_outcome->connection) QDBusConnection::disconnectFromBus(_name);
}

bool SystemBusConnector::hasEnded() const {
  const std::scoped_lock lock(_outcome->mutex);
  return _outcome->hasEnded;
}

std::optional<QDBusConnection> SystemBusConnector::take() {
  const std::scoped_lock lock(_outcome->mutex);
  return std::exchange(_outcome->connection, std::nullopt);
}

std::string SystemBusConnector::reason() const {
  const std::scoped_lock lock(_outcome->mutex);
  return _outcome->reason;
}

}  // namespace kestro
