// SPDX-License-Identifier: MIT
#include "Platform/Linux/PreferencesSignal.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <future>
#include <optional>
#include <thread>
#include <utility>

namespace kestro {
namespace {

constexpr std::chrono::milliseconds kPatience{1000};

/// Where the session bus is, if there is one. Asked itself, the bus library would start one, and
/// remember its first answer for ever.
std::optional<QString> sessionBusAddress() {
  const char* address = std::getenv("DBUS_SESSION_BUS_ADDRESS");
  if (address != nullptr && address[0] != '\0') return QString::fromLocal8Bit(address);
  const char* runtime = std::getenv("XDG_RUNTIME_DIR");
  if (runtime == nullptr) return std::nullopt;
  const std::filesystem::path socket = std::filesystem::path(runtime) / "bus";
  std::error_code error;
  if (!std::filesystem::exists(socket, error)) return std::nullopt;
  return QString::fromStdString("unix:path=" + socket.native());
}

/// A name of our own for the connection, closed again at the end.
class SessionBus {
 public:
  explicit SessionBus(const QString& address)
      : _connection(QDBusConnection::connectToBus(address, name())) {}
  ~SessionBus() { QDBusConnection::disconnectFromBus(name()); }
  SessionBus(const SessionBus&) = delete;
  SessionBus& operator=(const SessionBus&) = delete;

  [[nodiscard]] QDBusConnection& connection() { return _connection; }

 private:
  static QString name() { return QStringLiteral("org.kestro.Preferences1"); }

  QDBusConnection _connection;
};

Result<void> sendSignal(const QString& address, const std::string& domain, const std::string& key) {
  SessionBus bus(address);
  if (!bus.connection().isConnected()) return failure("the session bus cannot be reached");
  QDBusMessage signal =
      QDBusMessage::createSignal("/org/kestro/Preferences", "org.kestro.Preferences1", "Changed");
  signal << QString::fromStdString(domain) << QString::fromStdString(key);
  bus.connection().send(signal);
  // The bus answers in order, so its answer to anything says that it has the signal.
  const QDBusMessage ping = QDBusMessage::createMethodCall(
      "org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus", "GetId");
  const QDBusMessage answer =
      bus.connection().call(ping, QDBus::Block, static_cast<int>(kPatience.count()));
  if (answer.type() == QDBusMessage::ReplyMessage) return {};
  return failure("the session bus does not answer");
}

}  // namespace

Result<void> sendPreferenceChanged(const std::string& domain, const std::string& key) {
  const std::optional<QString> address = sessionBusAddress();
  if (!address) return failure("there is no session bus");
  // Connecting has no time limit of its own, so it gets a thread that can be left behind.
  std::packaged_task<Result<void>()> task(
      [address, domain, key] { return sendSignal(*address, domain, key); });
  std::future<Result<void>> result = task.get_future();
  std::thread(std::move(task)).detach();
  if (result.wait_for(kPatience) == std::future_status::ready) return result.get();
  return failure("the session bus does not answer");
}

}  // namespace kestro
