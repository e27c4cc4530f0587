// SPDX-License-Identifier: MIT
// Preferences as one INI file a domain, and the notification of changes on the session bus.
#pragma once

#include <filesystem>
#include <map>
#include <string>
#include <utility>

#include "Platform/Preferences.h"

namespace kestro {

class SystemLog;

class IniPreferences final : public Preferences {
 public:
  /// Keeps "DOMAIN.ini" files in `directory`, which is made when the first is written.
  IniPreferences(SystemLog& log, std::filesystem::path directory);

  /// $XDG_CONFIG_HOME/kestro/preferences.
  [[nodiscard]] static std::filesystem::path directoryFromEnvironment();

  [[nodiscard]] std::optional<bool> boolean(std::string_view domain,
                                            std::string_view key) const override;
  void setBoolean(std::string_view domain, std::string_view key, bool value) override;
  void synchronize(std::string_view domain) override;
  /// Emits the signal org.kestro.Preferences1.Changed(domain, key) from /org/kestro/Preferences.
  /// Waits at most a second for a session bus that does not answer.
  void notifyChanged(std::string_view domain, std::string_view key) override;

 private:
  using DomainAndKey = std::pair<std::string, std::string>;

  [[nodiscard]] std::filesystem::path fileOf(std::string_view domain) const;

  SystemLog& _log;
  std::filesystem::path _directory;
  std::map<DomainAndKey, bool> _unsaved;
};

}  // namespace kestro
