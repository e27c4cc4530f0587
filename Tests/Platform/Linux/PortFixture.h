// SPDX-License-Identifier: MIT
// Ports in a directory of their own, and peers that speak in bytes.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QCoreApplication>
#include <atomic>
#include <chrono>
#include <filesystem>
#include <functional>
#include <initializer_list>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Linux/MessagePorts.h"
#include "Platform/MessagePort.h"
#include "Platform/Virtual/VirtualServices.h"
#include "Tests/Support/TemporaryDirectory.h"

namespace kestro::testing {

using namespace std::chrono_literals;

inline constexpr std::size_t kMebibyte = std::size_t{1024} * 1024;

inline Bytes bytesOf(std::string_view text) { return {text.begin(), text.end()}; }
inline std::string textOf(ByteView bytes) { return {bytes.begin(), bytes.end()}; }

/// The bytes of several pieces, one after the other.
Bytes joined(std::initializer_list<Bytes> pieces);

/// A frame written out by hand: its header's bytes as the documentation has them, and a body.
Bytes frame(std::uint8_t kind, std::uint32_t messageId, std::uint32_t sequence,
            std::string_view body);

/// One end of a connection, as bytes; it blocks, at most 5 s a call.
class RawPeer {
 public:
  explicit RawPeer(FileDescriptor socket);
  /// Connects to the socket at `path`; not open when that fails.
  [[nodiscard]] static RawPeer connectedTo(const std::filesystem::path& path);

  [[nodiscard]] bool isOpen() const noexcept { return _socket.isOpen(); }
  void close() { _socket.reset(); }
  void send(const Bytes& bytes);
  /// The next `count` bytes; fewer when the stream ends or nothing comes for 5 s.
  [[nodiscard]] Bytes receive(std::size_t count);
  /// What can be read without waiting.
  [[nodiscard]] Bytes receiveAvailable();
  /// Whether the other end has closed. What it sent before is dropped.
  [[nodiscard]] bool isAtEnd();

 private:
  FileDescriptor _socket;
};

/// A listening socket, without Kestro's ports.
class RawListener {
 public:
  explicit RawListener(const std::filesystem::path& path);
  [[nodiscard]] RawPeer accept();

 private:
  FileDescriptor _socket;
};

class PortFixture : public ::testing::Test {
 protected:
  struct Message {
    std::int32_t id;
    std::string text;
    bool operator==(const Message&) const = default;
    friend void PrintTo(const Message& message, std::ostream* stream) {
      *stream << message.id << ' ' << message.text;
    }
  };

  PortFixture();

  [[nodiscard]] std::filesystem::path pathOf(std::string_view name) const {
    return directory.path() / name;
  }
  /// A local port that keeps what arrives in `messages` and answers with `reply`.
  [[nodiscard]] std::shared_ptr<LocalPort> openPort(std::string_view name);
  [[nodiscard]] RawPeer connectRaw(std::string_view name) {
    return RawPeer::connectedTo(pathOf(name));
  }

  /// Runs the event loop until `condition` holds; false when it does not within 5 s.
  bool turnUntil(const std::function<bool()>& condition);
  /// Runs the event loop until nothing is left to do.
  void turnUntilIdle();
  /// Runs the event loop until as many messages have arrived.
  bool turnUntilMessages(std::size_t count) {
    return turnUntil([&] { return messages.size() >= count; });
  }

  /// The texts of the log's lines.
  [[nodiscard]] std::vector<std::string> logTexts() const;

  TemporaryDirectory directory;
  RecordingSystemLog log;
  std::vector<Message> messages;
  std::optional<Bytes> reply;

 private:
  std::unique_ptr<QCoreApplication> _application;

 protected:
  std::unique_ptr<MessagePorts> ports;
};

/// A thread with ports of its own, as another process would have them, that serves one local port.
class PortThread {
 public:
  PortThread(const std::filesystem::path& directory, std::string name, ReceiveHandler handler);
  ~PortThread();
  PortThread(const PortThread&) = delete;
  PortThread& operator=(const PortThread&) = delete;

 private:
  std::atomic<bool> _ready = false;
  std::atomic<bool> _stop = false;
  std::thread _thread;
};

}  // namespace kestro::testing
