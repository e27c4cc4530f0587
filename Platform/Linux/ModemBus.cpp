// SPDX-License-Identifier: MIT
#include "Platform/Linux/ModemBus.h"

#include <QDBusError>
#include <QDBusPendingCallWatcher>
#include <array>
#include <chrono>
#include <utility>

#include "Platform/Linux/BusValues.h"

namespace kestro {
namespace {

constexpr const char* kModemManager = "org.freedesktop.ModemManager1";
constexpr const char* kBus = "org.freedesktop.DBus";
constexpr const char* kBusPath = "/org/freedesktop/DBus";

constexpr std::chrono::milliseconds kConnectingLook{50};
constexpr std::chrono::milliseconds kConnectedLook{1'000};
constexpr std::chrono::milliseconds kRetry{2'000};
constexpr std::chrono::milliseconds kOwnerDeadline{5'000};

/// The signals that are followed.
struct SignalName {
  const char* interface;
  const char* member;
};
constexpr std::array kSignals = {
    SignalName{"org.freedesktop.DBus.ObjectManager", "InterfacesAdded"},
    SignalName{"org.freedesktop.DBus.ObjectManager", "InterfacesRemoved"},
    SignalName{"org.freedesktop.DBus.Properties", "PropertiesChanged"},
};

BusReply replyIn(const QDBusMessage& message) {
  if (message.type() == QDBusMessage::ErrorMessage) {
    return tl::unexpected(
        BusError{message.errorName().toStdString(), message.errorMessage().toStdString()});
  }
  auto values = busValues(message.arguments(), ModemService::kMaximumValues);
  if (values) return *std::move(values);
  return tl::unexpected(BusError{std::string(kBusErrorLimits), "the answer is too long"});
}

}  // namespace

ModemBus::ModemBus(ModemServiceHandlers handlers)
    : _handlers(std::move(handlers)), _connector(std::make_unique<SystemBusConnector>()) {
  QObject::connect(&_timer, &QTimer::timeout, this, [this] { look(); });
  _timer.start(kConnectingLook);
}

ModemBus::~ModemBus() {
  if (!_connection) return;
  _connection.reset();
  QDBusConnection::disconnectFromBus(_connectionName);
}

void ModemBus::look() {
  if (_connection) {
    if (!_connection->isConnected()) lose("the system bus has closed the connection");
  } else if (!_connector) {
    _connector = std::make_unique<SystemBusConnector>();
    _timer.start(kConnectingLook);
  } else if (_connector->hasEnded()) {
    takeConnection();
  }
}

void ModemBus::takeConnection() {
  const auto connector = std::exchange(_connector, nullptr);
  _connection = connector->take();
  if (!_connection) return lose(connector->reason());
  _connectionName = connector->name();
  _timer.start(kConnectedLook);
  // The name of the service stays empty here and below; `receive` looks at the sender.
  _connection->connect(QString(), kBusPath, kBus, "NameOwnerChanged", {kModemManager}, QString(),
                       this, SLOT(receive(QDBusMessage)));
  askForOwner();
}

void ModemBus::lose(const std::string& reason) {
  _owner.clear();
  if (_connection) {
    _connection.reset();
    QDBusConnection::disconnectFromBus(_connectionName);
  }
  _timer.start(kRetry);
  setState(ModemServiceState::NoBus, reason.empty() ? "it cannot be reached" : reason);
}

void ModemBus::askForOwner() {
  auto message = QDBusMessage::createMethodCall(kBus, kBusPath, kBus, "GetNameOwner");
  message << QString(kModemManager);
  auto* watcher = new QDBusPendingCallWatcher(
      _connection->asyncCall(message, static_cast<int>(kOwnerDeadline.count())), this);
  QObject::connect(watcher, &QDBusPendingCallWatcher::finished, this,
                   [this, watcher, name = _connectionName]() noexcept {
                     watcher->deleteLater();
                     if (!_connection || name != _connectionName) return;
                     const QDBusMessage reply = watcher->reply();
                     const bool isError = reply.type() == QDBusMessage::ErrorMessage;
                     setOwner(isError ? QString() : reply.arguments().value(0).toString());
                   });
}

void ModemBus::setOwner(const QString& owner) {
  if (owner == _owner && _state != ModemServiceState::Connecting &&
      _state != ModemServiceState::NoBus) {
    return;
  }
  if (!_owner.isEmpty()) follow(false);
  _owner = owner;
  if (!_owner.isEmpty()) follow(true);
  if (_state == ModemServiceState::Present) setState(ModemServiceState::Absent);
  setState(_owner.isEmpty() ? ModemServiceState::Absent : ModemServiceState::Present);
}

void ModemBus::follow(bool isFollowing) {
  for (const auto& [interface, member] : kSignals) {
    if (isFollowing) {
      _connection->connect(_owner, QString(), interface, member, this, SLOT(receive(QDBusMessage)));
    } else {
      _connection->disconnect(_owner, QString(), interface, member, this,
                              SLOT(receive(QDBusMessage)));
    }
  }
}

void ModemBus::setState(ModemServiceState state, const std::string& reason) {
  if (std::exchange(_state, state) == state && std::exchange(_reason, reason) == reason) return;
  _reason = reason;
  _handlers.stateChanged(state, reason);
}

void ModemBus::receive(const QDBusMessage& message) {
  if (message.member() == QLatin1String("NameOwnerChanged")) {
    if (message.service() == QLatin1String(kBus)) setOwner(message.arguments().value(2).toString());
    return;
  }
  if (_owner.isEmpty() || message.service() != _owner) return;
  auto arguments = busValues(message.arguments(), ModemService::kMaximumValues);
  if (!arguments) return;
  _handlers.signalled({message.path().toStdString(), message.interface().toStdString(),
                       message.member().toStdString(), *std::move(arguments)});
}

void ModemBus::call(const BusCall& call, std::chrono::milliseconds deadline,
                    std::function<void(const BusReply& reply)> answered) {
  if (!_connection || _owner.isEmpty()) {
    QTimer::singleShot(0, this, [answered = std::move(answered)]() noexcept {
      answered(tl::unexpected(BusError{std::string(kBusErrorDisconnected), "not connected"}));
    });
    return;
  }
  auto message = QDBusMessage::createMethodCall(_owner, QString::fromStdString(call.path),
                                                QString::fromStdString(call.interface),
                                                QString::fromStdString(call.method));
  message.setAutoStartService(false);
  for (const BusValue& argument : call.arguments) message << qtValue(argument);
  auto* watcher = new QDBusPendingCallWatcher(
      _connection->asyncCall(message, static_cast<int>(deadline.count())), this);
  QObject::connect(watcher, &QDBusPendingCallWatcher::finished, this,
                   [watcher, answered = std::move(answered)]() noexcept {
                     watcher->deleteLater();
                     answered(replyIn(watcher->reply()));
                   });
}

}  // namespace kestro
