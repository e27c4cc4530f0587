// SPDX-License-Identifier: MIT
// ModemManager on the system bus, by Qt's D-Bus.
#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QObject>
#include <QTimer>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Platform/Linux/SystemBus.h"
#include "Platform/ModemService.h"

namespace kestro {

/// Follows ModemManager by the unique name of its owner: asking Qt for signals of a well-known name
/// would wait for the bus to tell who that is.
class ModemBus final : public QObject, public ModemServiceConnection {
  Q_OBJECT

 public:
  explicit ModemBus(ModemServiceHandlers handlers);
  ~ModemBus() override;

  void call(const BusCall& call, std::chrono::milliseconds deadline,
            std::function<void(const BusReply& reply)> answered) override;

 private Q_SLOTS:
  void receive(const QDBusMessage& message);

 private:
  void look();
  void takeConnection();
  void lose(const std::string& reason);
  void askForOwner();
  void setOwner(const QString& owner);
  void follow(bool isFollowing);
  void setState(ModemServiceState state, const std::string& reason = "");

  ModemServiceHandlers _handlers;
  std::unique_ptr<SystemBusConnector> _connector;
  std::optional<QDBusConnection> _connection;
  QString _connectionName;
  QString _owner;  ///< empty: nobody
  QTimer _timer;   ///< looks whether the connection has come, or has gone
  ModemServiceState _state = ModemServiceState::Connecting;
  std::string _reason;
};

class LinuxModemService final : public ModemService {
 public:
  [[nodiscard]] std::unique_ptr<ModemServiceConnection> connect(
      ModemServiceHandlers handlers) override {
    return std::make_unique<ModemBus>(std::move(handlers));
  }
};

}  // namespace kestro
