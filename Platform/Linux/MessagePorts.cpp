// SPDX-License-Identifier: MIT
#include "Platform/Linux/MessagePorts.h"

#include <unistd.h>

#include <string>
#include <utility>

#include "Platform/Linux/PortConnection.h"
#include "Platform/Linux/PortDirectory.h"
#include "Platform/Linux/PortPeer.h"
#include "Platform/Linux/UnixLocalPort.h"
#include "Platform/Linux/UnixRemotePort.h"
#include "Platform/PortName.h"

namespace kestro {
namespace {

class UnixMessagePorts final : public MessagePorts {
 public:
  UnixMessagePorts(SystemLog& log, const UnixMessagePortsOptions& options)
      : _directory(portDirectoryPath(options.portDirectory)),
        _context(std::make_shared<PortContext>(log, options.peerUser.value_or(::geteuid()),
                                               options.patience)) {}

  [[nodiscard]] std::shared_ptr<LocalPort> createLocalPort(std::string_view name,
                                                           ReceiveHandler handler) override;
  [[nodiscard]] std::shared_ptr<RemotePort> createRemotePort(std::string_view name) override;
  [[nodiscard]] std::string problem() const override { return _problem; }

 private:
  std::nullptr_t refuse(std::string_view what, std::string_view name, std::string_view reason);

  std::string _directory;
  std::string _problem;  ///< with the directory, when it was last opened
  bool _tidied = false;  ///< whether the directory has been rid of dead owners' files
  std::shared_ptr<PortContext> _context;
};

std::nullptr_t UnixMessagePorts::refuse(std::string_view what, std::string_view name,
                                        std::string_view reason) {
  _context->log.log(LogPriority::Error, "Message port \"{}\": cannot {}: {}", name, what, reason);
  return nullptr;
}

std::shared_ptr<LocalPort> UnixMessagePorts::createLocalPort(std::string_view name,
                                                             ReceiveHandler handler) {
  constexpr std::string_view kWhat = "open";
  if (!isPortName(name)) return refuse(kWhat, name, "this is no port name");
  const auto directory = PortDirectory::openOrMake(_directory);
  _problem = directory ? "" : directory.error().message;
  if (!directory) return refuse(kWhat, name, directory.error().message);
  if (!std::exchange(_tidied, true)) directory->removeDeadOwners();
  auto listener = directory->listen(std::string(name));
  if (!listener) return refuse(kWhat, name, listener.error().message);
  return std::make_shared<UnixLocalPort>(std::move(*listener), std::string(name),
                                         std::move(handler), _context);
}

std::shared_ptr<RemotePort> UnixMessagePorts::createRemotePort(std::string_view name) {
  constexpr std::string_view kWhat = "connect";
  if (!isPortName(name)) return refuse(kWhat, name, "this is no port name");
  const auto directory = PortDirectory::openExisting(_directory);
  _problem = directory ? "" : directory.error().message;
  if (!directory) return refuse(kWhat, name, directory.error().message);
  if (!*directory) return nullptr;
  auto socket = (*directory)->connect(std::string(name));
  if (!socket) return refuse(kWhat, name, socket.error().message);
  if (!*socket) return nullptr;
  const auto peer = peerOf((*socket)->get());
  if (!peer || peer->user != _context->peerUser) {
    return refuse(kWhat, name, "its owner is another user");
  }
  return std::make_shared<UnixRemotePort>(std::move(**socket), peer->process, std::string(name),
                                          _context);
}

}  // namespace

std::unique_ptr<MessagePorts> createUnixMessagePorts(SystemLog& log,
                                                     const UnixMessagePortsOptions& options) {
  return std::make_unique<UnixMessagePorts>(log, options);
}

}  // namespace kestro
