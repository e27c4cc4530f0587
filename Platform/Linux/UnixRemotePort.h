// SPDX-License-Identifier: MIT
// The sending end of a connection.
#pragma once

#include <memory>
#include <string>

#include "Platform/Linux/PortConnection.h"
#include "Platform/MessagePort.h"

namespace kestro {

/// A remote port is its connection: only replies arrive here, and those that nobody awaits any more
/// are dropped as they come. Made by make_shared only.
class UnixRemotePort final : public RemotePort, public PortConnection {
 public:
  /// `socket` is connected and non-blocking, to the process `owner`.
  UnixRemotePort(FileDescriptor socket, ProcessNumber owner, std::string portName,
                 std::shared_ptr<PortContext> context);
  ~UnixRemotePort() override;

  SendError post(std::int32_t messageId, ByteView message) override;
  SendError send(std::int32_t messageId, ByteView message,
                 std::chrono::nanoseconds sendTimeout) override;
  [[nodiscard]] Reply request(std::int32_t messageId, ByteView message,
                              std::chrono::nanoseconds sendTimeout,
                              std::chrono::nanoseconds receiveTimeout) override;
  void invalidate() override { close(); }
  [[nodiscard]] bool isValid() const override;
  [[nodiscard]] std::size_t unsentMessages(std::int32_t messageId) const override {
    return unsent(messageId);
  }
  [[nodiscard]] ProcessNumber owner() const override { return _owner; }

 private:
  void onReadable() override;
  void onClosed() override { reader().clear(); }
  /// The most that may wait now.
  [[nodiscard]] std::size_t mostQueuedBytes() const;
  [[nodiscard]] SendError transmit(const PortFrameHeader& header, ByteView message,
                                   PortDeadline deadline);
  [[nodiscard]] Reply awaitReply(std::uint32_t sequence, PortDeadline deadline);
  [[nodiscard]] std::optional<PortFrame> findReply(std::uint32_t sequence);
  [[nodiscard]] bool readOnce();

  ProcessNumber _owner;
  std::uint32_t _lastSequence = 0;
};

}  // namespace kestro
