// SPDX-License-Identifier: MIT
#include "Platform/Linux/IniPreferences.h"

#include <QSettings>
#include <QString>

#include "Platform/Linux/PreferencesSignal.h"
#include "Platform/Linux/XdgDirectories.h"
#include "Platform/SystemLog.h"

namespace kestro {
namespace {

QString qtText(std::string_view text) {
  return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

}  // namespace

IniPreferences::IniPreferences(SystemLog& log, std::filesystem::path directory)
    : _log(log), _directory(std::move(directory)) {}

std::filesystem::path IniPreferences::directoryFromEnvironment() {
  return xdgConfigHome() / "kestro" / "preferences";
}

std::filesystem::path IniPreferences::fileOf(std::string_view domain) const {
  return _directory / fmt::format("{}.ini", domain);
}

std::optional<bool> IniPreferences::boolean(std::string_view domain, std::string_view key) const {
  const auto unsaved = _unsaved.find(DomainAndKey(domain, key));
  if (unsaved != _unsaved.end()) return unsaved->second;
  const QSettings settings(qtText(fileOf(domain).native()), QSettings::IniFormat);
  const QString value = settings.value(qtText(key)).toString();
  if (value == "true") return true;
  if (value == "false") return false;
  return std::nullopt;
}

void IniPreferences::setBoolean(std::string_view domain, std::string_view key, bool value) {
  _unsaved[DomainAndKey(domain, key)] = value;
}

void IniPreferences::synchronize(std::string_view domain) {
  const std::string file = fileOf(domain).native();
  QSettings settings(qtText(file), QSettings::IniFormat);
  for (const auto& [place, value] : _unsaved) {
    if (place.first == domain) settings.setValue(qtText(place.second), value);
  }
  settings.sync();
  if (settings.status() != QSettings::NoError) {
    _log.log(LogPriority::Error, "Unable to write preferences to {}", file);
    return;
  }
  std::erase_if(_unsaved, [domain](const auto& entry) { return entry.first.first == domain; });
}

void IniPreferences::notifyChanged(std::string_view domain, std::string_view key) {
  const Result<void> sent = sendPreferenceChanged(std::string(domain), std::string(key));
  if (sent) return;
  _log.log(LogPriority::Warning, "Unable to tell that {} of {} changed: {}", key, domain,
           sent.error().message);
}

}  // namespace kestro
