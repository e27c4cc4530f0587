// SPDX-License-Identifier: MIT
// What a service said that cannot be used, told once each.
#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <string_view>
#include <utility>

#include "Sources/LogSource.h"

namespace kestro {

/// Names values of a wrong type or beyond all sense, each once. A service that invents names has
/// the first kMaximumNames of them named.
class BusFaults {
 public:
  static constexpr std::size_t kMaximumNames = 256;

  explicit BusFaults(SourceReporter report) : _report(std::move(report)) {}

  void wrongType(std::string_view name, std::string_view expected, std::string_view found);
  void senseless(std::string_view name, std::string_view value);

  /// So many values were left out, the repeated ones counted.
  [[nodiscard]] std::size_t count() const noexcept { return _count; }

 private:
  void tell(std::string_view name, std::string_view what);

  SourceReporter _report;
  std::set<std::string, std::less<>> _named;
  std::size_t _count = 0;
};

}  // namespace kestro
