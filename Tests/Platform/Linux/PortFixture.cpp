// SPDX-License-Identifier: MIT
#include "Tests/Platform/Linux/PortFixture.h"

#include <sys/socket.h>
#include <sys/time.h>
#include <sys/un.h>

#include <QEventLoop>
#include <array>
#include <cstdlib>
#include <cstring>
#include <utility>

namespace kestro::testing {
namespace {

constexpr auto kPatience = 5s;

sockaddr_un addressOf(const std::filesystem::path& path) {
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  std::strncpy(address.sun_path, path.c_str(), sizeof(address.sun_path) - 1);
  return address;
}

FileDescriptor newSocket() {
  return FileDescriptor(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
}

}  // namespace

Bytes joined(std::initializer_list<Bytes> pieces) {
  Bytes result;
  for (const Bytes& piece : pieces) result.insert(result.end(), piece.begin(), piece.end());
  return result;
}

Bytes frame(std::uint8_t kind, std::uint32_t messageId, std::uint32_t sequence,
            std::string_view body) {
  Bytes result = {kind, 0, 0, 0};
  for (const std::size_t field : {std::size_t{messageId}, std::size_t{sequence}, body.size()}) {
    for (int shift = 0; shift < 32; shift += 8) {
      result.push_back(static_cast<std::uint8_t>((field >> shift) & 0xFF));
    }
  }
  result.insert(result.end(), body.begin(), body.end());
  return result;
}

RawPeer::RawPeer(FileDescriptor socket) : _socket(std::move(socket)) {
  const timeval patience{std::chrono::seconds(kPatience).count(), 0};
  ::setsockopt(_socket.get(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof(patience));
  ::setsockopt(_socket.get(), SOL_SOCKET, SO_SNDTIMEO, &patience, sizeof(patience));
}

RawPeer RawPeer::connectedTo(const std::filesystem::path& path) {
  FileDescriptor socket = newSocket();
  const sockaddr_un address = addressOf(path);
  if (::connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)) != 0) {
    socket.reset();
  }
  return RawPeer(std::move(socket));
}

void RawPeer::send(const Bytes& bytes) {
  std::size_t sent = 0;
  while (sent < bytes.size()) {
    const ssize_t count =
        ::send(_socket.get(), bytes.data() + sent, bytes.size() - sent, MSG_NOSIGNAL);
    if (count <= 0) return;
    sent += static_cast<std::size_t>(count);
  }
}

Bytes RawPeer::receive(std::size_t count) {
  Bytes result(count);
  std::size_t received = 0;
  while (received < count) {
    const ssize_t got = ::recv(_socket.get(), result.data() + received, count - received, 0);
    if (got <= 0) break;
    received += static_cast<std::size_t>(got);
  }
  result.resize(received);
  return result;
}

Bytes RawPeer::receiveAvailable() {
  Bytes result;
  std::array<std::uint8_t, 65536> piece{};
  for (;;) {
    const ssize_t got = ::recv(_socket.get(), piece.data(), piece.size(), MSG_DONTWAIT);
    if (got <= 0) return result;
    result.insert(result.end(), piece.begin(), piece.begin() + got);
  }
}

bool RawPeer::isAtEnd() {
  static_cast<void>(receiveAvailable());
  std::uint8_t byte = 0;
  const ssize_t got = ::recv(_socket.get(), &byte, 1, MSG_DONTWAIT);
  return got == 0 || (got < 0 && errno == ECONNRESET);
}

RawListener::RawListener(const std::filesystem::path& path) : _socket(newSocket()) {
  const sockaddr_un address = addressOf(path);
  EXPECT_EQ(::bind(_socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof(address)), 0);
  EXPECT_EQ(::listen(_socket.get(), 8), 0);
}

RawPeer RawListener::accept() {
  return RawPeer(FileDescriptor(::accept4(_socket.get(), nullptr, nullptr, SOCK_CLOEXEC)));
}

PortFixture::PortFixture() {
  if (QCoreApplication::instance() == nullptr) {
    static int count = 1;
    static char name[] = "test";
    static char* arguments[] = {name, nullptr};
    _application = std::make_unique<QCoreApplication>(count, arguments);
  }
  ports = createUnixMessagePorts(log, directory.path().string());
}

std::shared_ptr<LocalPort> PortFixture::openPort(std::string_view name) {
  return ports->createLocalPort(name,
                                [this](std::int32_t id, ByteView message) -> std::optional<Bytes> {
                                  messages.push_back({id, textOf(message)});
                                  return reply;
                                });
}

bool PortFixture::turnUntil(const std::function<bool()>& condition) {
  const auto deadline = std::chrono::steady_clock::now() + kPatience;
  while (!condition()) {
    if (std::chrono::steady_clock::now() > deadline) return false;
    QCoreApplication::processEvents(QEventLoop::AllEvents);
    std::this_thread::sleep_for(100us);
  }
  return true;
}

void PortFixture::turnUntilIdle() {
  for (int turn = 0; turn < 20; ++turn) QCoreApplication::processEvents(QEventLoop::AllEvents);
}

std::vector<std::string> PortFixture::logTexts() const {
  std::vector<std::string> texts;
  for (const auto& line : log.lines()) texts.push_back(line.text);
  return texts;
}

PortThread::PortThread(const std::filesystem::path& directory, std::string name,
                       ReceiveHandler handler)
    : _thread(
          [this, path = directory.string(), name = std::move(name), handler = std::move(handler)] {
            QEventLoop loop;
            RecordingSystemLog log;
            const auto ports = createUnixMessagePorts(log, path);
            const auto port = ports->createLocalPort(name, handler);
            _ready = true;
            while (!_stop) {
              loop.processEvents();
              std::this_thread::sleep_for(100us);
            }
          }) {
  while (!_ready) std::this_thread::sleep_for(100us);
}

PortThread::~PortThread() {
  _stop = true;
  _thread.join();
}

}  // namespace kestro::testing
