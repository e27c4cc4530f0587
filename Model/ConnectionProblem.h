// SPDX-License-Identifier: MIT
// Why there is no connection to the telephony server.
#pragma once

#include <string>
#include <string_view>

namespace kestro {

/// What went wrong at the last attempt to connect.
struct ConnectionProblem {
  enum class Kind {
    Ports,       ///< no port can be made; `detail` says why
    NoServer,    ///< nobody owns the server's port
    NoChannel,   ///< the server gives no log channel; `detail` is its error
    NoAnswer,    ///< the server does not say what it speaks, or does not take the start command
    Technology,  ///< nothing here decodes the technology; `detail` is its name
  };
  Kind kind = Kind::NoServer;
  std::string detail{};

  friend bool operator==(const ConnectionProblem&, const ConnectionProblem&) = default;
};

/// One line for a person: what is missing, and what helps. `serverName` is the port's name.
[[nodiscard]] std::string problemText(const ConnectionProblem& problem,
                                      std::string_view serverName);

}  // namespace kestro
