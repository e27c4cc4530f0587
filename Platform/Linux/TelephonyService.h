// SPDX-License-Identifier: MIT
// The telephony server's client side, on any kind of message ports.
#pragma once

#include <memory>
#include <string>

#include "Platform/MessagePort.h"
#include "Platform/PropertyListCoding.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyService.h"
#include "Platform/Uuids.h"

namespace kestro {

/// The service that talks to the telephony server whose port is called `serverName`. The references
/// must stay valid as long as the service. Registrations receive on a port of their own,
/// "TelephonyClient.<UUID>".
[[nodiscard]] std::unique_ptr<TelephonyService> createPortTelephonyService(
    MessagePorts& ports, Uuids& uuids, const PropertyListCoding& coding, SystemLog& log,
    std::string serverName);

}  // namespace kestro
