// SPDX-License-Identifier: MIT
// A connection to the system bus that is made without waiting for it.
#pragma once

#include <QDBusConnection>
#include <QString>
#include <memory>
#include <optional>
#include <string>

namespace kestro {

/// Connects on a thread of its own, which is left behind when nobody wants the connection any more:
/// connecting has no time limit.
class SystemBusConnector {
 public:
  /// Begins to connect to the bus that $DBUS_SYSTEM_BUS_ADDRESS names, else to the system's.
  SystemBusConnector();
  /// A connection that was not taken is closed.
  ~SystemBusConnector();
  SystemBusConnector(const SystemBusConnector&) = delete;
  SystemBusConnector& operator=(const SystemBusConnector&) = delete;

  /// Whether the attempt is over.
  [[nodiscard]] bool hasEnded() const;
  /// The connection, once; absent when there is none, for the reason that `reason` says. Only after
  /// the end.
  [[nodiscard]] std::optional<QDBusConnection> take();
  [[nodiscard]] std::string reason() const;
  /// The connection's name, by which whoever took it disconnects it.
  [[nodiscard]] const QString& name() const noexcept { return _name; }

 private:
  struct Outcome;
  QString _name;
  std::shared_ptr<Outcome> _outcome;
};

}  // namespace kestro
