// SPDX-License-Identifier: MIT
// Preferences of this program and of others, one domain each.
#pragma once

#include <optional>
#include <string_view>

namespace kestro {

/// This program's own domain, and the home-screen shell's.
inline constexpr std::string_view kKestroPreferencesDomain = "org.kestro.Kestro";
inline constexpr std::string_view kShellPreferencesDomain = "org.lumo.Shell";

class Preferences {
 public:
  Preferences() = default;
  virtual ~Preferences() = default;
  Preferences(const Preferences&) = delete;
  Preferences& operator=(const Preferences&) = delete;

  /// The boolean under `key`; absent when the domain has no such key or it is no boolean.
  [[nodiscard]] virtual std::optional<bool> boolean(std::string_view domain,
                                                    std::string_view key) const = 0;

  /// Sets a boolean in any domain. It reaches the store with the next `synchronize`.
  virtual void setBoolean(std::string_view domain, std::string_view key, bool value) = 0;

  /// Writes what was set in `domain`; failures leave a log line.
  virtual void synchronize(std::string_view domain) = 0;

  /// Tells whoever listens that `key` of `domain` changed; failures leave a log line.
  virtual void notifyChanged(std::string_view domain, std::string_view key) = 0;
};

}  // namespace kestro
