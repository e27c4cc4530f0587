// SPDX-License-Identifier: MIT
#include "Model/ConnectionProblem.h"

#include <fmt/format.h>

#include "Platform/TelephonyProtocol.h"

namespace kestro {

std::string problemText(const ConnectionProblem& problem, std::string_view serverName) {
  switch (problem.kind) {
    case ConnectionProblem::Kind::Ports:
      return problem.detail;
    case ConnectionProblem::Kind::NoServer:
      return fmt::format(
          "no telephony server \"{}\" is running: start kestro-telephonyd{}, or use "
          "--demo",
          serverName,
          serverName == kDefaultServerName ? "" : fmt::format(" --name={}", serverName));
    case ConnectionProblem::Kind::NoChannel:
      return fmt::format("the telephony server \"{}\" gives no log channel (error {})", serverName,
                         problem.detail);
    case ConnectionProblem::Kind::NoAnswer:
      break;
    case ConnectionProblem::Kind::Technology:
      return fmt::format("the telephony server \"{}\" speaks {}, which nothing here decodes",
                         serverName, problem.detail);
  }
  return fmt::format("the telephony server \"{}\" does not answer", serverName);
}

}  // namespace kestro
