// SPDX-License-Identifier: MIT
// Whether the desktop wants light or dark colours, where the toolkit does not find out by itself.
#pragma once

#include <QDBusVariant>
#include <QObject>
#include <QPalette>
#include <QString>

namespace kestro {

/// Dark colours for everything, and light ones.
[[nodiscard]] QPalette darkPalette();
[[nodiscard]] QPalette lightPalette();

enum class ColourStyle { System, Light, Dark };

/// Asks the desktop's settings portal on the session bus, and follows it while this lives: the
/// application has dark colours while the desktop prefers them, else those that it had before. A
/// toolkit that has found dark colours by itself is left alone, and without a bus or a portal
/// nothing happens. Nothing here waits for the bus. With another style than the system's the
/// application has its colours while this lives, whatever the desktop says.
class SystemColours : public QObject {
  Q_OBJECT

 public:
  explicit SystemColours(ColourStyle style = ColourStyle::System);
  ~SystemColours() override;

 private Q_SLOTS:
  void settingChanged(const QString& group, const QString& key, const QDBusVariant& value);

 private:
  void follow();
  void apply(const QVariant& value);

  QPalette _usualPalette;
  bool _isChosen;
};

}  // namespace kestro
