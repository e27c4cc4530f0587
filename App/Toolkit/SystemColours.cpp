// SPDX-License-Identifier: MIT
#include "App/Toolkit/SystemColours.h"

#include <QApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QFile>
#include <QPointer>
#include <optional>
#include <thread>

namespace kestro {
namespace {

QString connectionName() { return QStringLiteral("org.kestro.Colours"); }

constexpr const char* kService = "org.freedesktop.portal.Desktop";
constexpr const char* kPath = "/org/freedesktop/portal/desktop";
constexpr const char* kInterface = "org.freedesktop.portal.Settings";
constexpr const char* kGroup = "org.freedesktop.appearance";
constexpr const char* kKey = "color-scheme";
constexpr uint kPrefersDark = 1;

/// Where the session bus is. Asked itself, the bus library would start one.
std::optional<QString> busAddress() {
  const QString address = qEnvironmentVariable("DBUS_SESSION_BUS_ADDRESS");
  if (!address.isEmpty()) return address;
  const QString runtime = qEnvironmentVariable("XDG_RUNTIME_DIR");
  if (runtime.isEmpty()) return std::nullopt;
  const QString socket = runtime + QStringLiteral("/bus");
  if (!QFile::exists(socket)) return std::nullopt;
  return QStringLiteral("unix:path=") + socket;
}

bool isDark(const QPalette& palette) {
  return palette.color(QPalette::Window).lightness() < palette.color(QPalette::Text).lightness();
}

}  // namespace

QPalette darkPalette() {
  constexpr QColor kText(0xf2, 0xf2, 0xf2);
  QPalette palette(QColor(0x30, 0x30, 0x30));
  palette.setColor(QPalette::Window, QColor(0x24, 0x24, 0x24));
  palette.setColor(QPalette::WindowText, kText);
  palette.setColor(QPalette::Base, QColor(0x1b, 0x1b, 0x1d));
  palette.setColor(QPalette::Text, kText);
  palette.setColor(QPalette::ButtonText, kText);
  palette.setColor(QPalette::PlaceholderText, QColor(0x8e, 0x8e, 0x93));
  palette.setColor(QPalette::Highlight, QColor(0x35, 0x84, 0xe4));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  return palette;
}

QPalette lightPalette() {
  constexpr QColor kText(0x1c, 0x1c, 0x1e);
  QPalette palette(QColor(0xe6, 0xe6, 0xe6));
  palette.setColor(QPalette::Window, QColor(0xf2, 0xf2, 0xf2));
  palette.setColor(QPalette::WindowText, kText);
  palette.setColor(QPalette::Base, Qt::white);
  palette.setColor(QPalette::Text, kText);
  palette.setColor(QPalette::ButtonText, kText);
  palette.setColor(QPalette::PlaceholderText, QColor(0x8e, 0x8e, 0x93));
  palette.setColor(QPalette::Highlight, QColor(0x1c, 0x71, 0xd8));
  palette.setColor(QPalette::HighlightedText, Qt::white);
  return palette;
}

SystemColours::SystemColours(ColourStyle style)
    : _usualPalette(QApplication::palette()), _isChosen(style != ColourStyle::System) {
  if (_isChosen) {
    QApplication::setPalette(style == ColourStyle::Dark ? darkPalette() : lightPalette());
    return;
  }
  const auto address = busAddress();
  if (!address || isDark(_usualPalette)) return;
  // Connecting has no time limit, so it gets a thread that can be left behind.
  const QPointer<SystemColours> self(this);
  std::thread([address = *address, self] {
    const auto bus = QDBusConnection::connectToBus(address, connectionName());
    if (!bus.isConnected() || QCoreApplication::instance() == nullptr) return;
    QMetaObject::invokeMethod(QCoreApplication::instance(), [self] {
      if (self) self->follow();
    });
  }).detach();
}

SystemColours::~SystemColours() {
  QDBusConnection::disconnectFromBus(connectionName());
  if (_isChosen) QApplication::setPalette(_usualPalette);
}

void SystemColours::follow() {
  QDBusConnection bus(connectionName());
  // The bus library finds the types of a slot by their names, and knows only names that were used.
  qRegisterMetaType<QDBusVariant>();
  bus.connect(kService, kPath, kInterface, QStringLiteral("SettingChanged"), this,
              SLOT(settingChanged(QString, QString, QDBusVariant)));
  QDBusMessage question =
      QDBusMessage::createMethodCall(kService, kPath, kInterface, QStringLiteral("Read"));
  question << QString(kGroup) << QString(kKey);
  auto* watcher = new QDBusPendingCallWatcher(bus.asyncCall(question), this);
  connect(watcher, &QDBusPendingCallWatcher::finished, this, [this, watcher] {
    const QDBusPendingReply<QDBusVariant> reply = *watcher;
    if (reply.isValid()) apply(reply.value().variant());
    watcher->deleteLater();
  });
}

void SystemColours::settingChanged(const QString& group, const QString& key,
                                   const QDBusVariant& value) {
  if (group == QLatin1String(kGroup) && key == QLatin1String(kKey)) apply(value.variant());
}

void SystemColours::apply(const QVariant& value) {
  // The answer to a question has its number in a variant of its own.
  const QVariant number =
      value.canConvert<QDBusVariant>() ? value.value<QDBusVariant>().variant() : value;
  QApplication::setPalette(number.toUInt() == kPrefersDark ? darkPalette() : _usualPalette);
}

}  // namespace kestro
