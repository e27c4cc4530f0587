// SPDX-License-Identifier: MIT
#include "Sources/Modem/PolledCall.h"

#include <algorithm>
#include <array>
#include <string_view>

namespace kestro {
namespace {

constexpr std::array<std::string_view, 4> kUnsupported = {
    "org.freedesktop.ModemManager1.Error.Core.Unsupported",
    "org.freedesktop.DBus.Error.UnknownMethod",
    "org.freedesktop.DBus.Error.UnknownInterface",
    "org.freedesktop.DBus.Error.NotSupported",
};
constexpr std::array<std::string_view, 3> kPermission = {
    "org.freedesktop.ModemManager1.Error.Core.Unauthorized",
    "org.freedesktop.DBus.Error.AccessDenied",
    "org.freedesktop.DBus.Error.AuthFailed",
};

}  // namespace

bool isUnsupportedError(const BusError& error) {
  return std::ranges::find(kUnsupported, error.name) != kUnsupported.end();
}

bool isPermissionError(const BusError& error) {
  return std::ranges::find(kPermission, error.name) != kPermission.end();
}

void PolledCall::answered(const BusReply& reply) {
  _isPending = false;
  _error = reply ? std::nullopt : std::optional(reply.error());
  if (reply) return;
  _isUnsupported = isUnsupportedError(*_error);
  if (_error->name != kBusErrorNoReply) _wait = kPause;
}

}  // namespace kestro
