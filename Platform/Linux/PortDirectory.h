// SPDX-License-Identifier: MIT
// The directory whose sockets are the ports: who may use it, and who owns a name in it.
#pragma once

#include <sys/stat.h>
#include <sys/un.h>

#include <optional>
#include <string>
#include <string_view>

#include "Platform/Linux/FileDescriptor.h"
#include "Platform/Result.h"

namespace kestro {

/// The directory that holds the ports: `given`, else $KESTRO_PORT_DIR, else
/// $XDG_RUNTIME_DIR/kestro, else /tmp/kestro-<uid>; what is empty counts as absent. Absolute.
[[nodiscard]] std::string portDirectoryPath(const std::optional<std::string>& given);

/// A listening socket and the name that it owns. Gives the name back when destroyed.
class PortListener {
 public:
  PortListener(PortListener&&) noexcept = default;
  PortListener& operator=(PortListener&&) = delete;
  ~PortListener();

  /// The listening socket: non-blocking.
  [[nodiscard]] int socket() const noexcept { return _socket.get(); }

  /// Whether the name still leads to this socket. False once its file is removed or replaced.
  [[nodiscard]] bool ownsName() const;

 private:
  friend class PortDirectory;
  PortListener(FileDescriptor socket, FileDescriptor directory, std::string name,
               const struct stat& file)
      : _socket(std::move(socket)),
        _directory(std::move(directory)),
        _name(std::move(name)),
        _device(file.st_dev),
        _inode(file.st_ino) {}

  FileDescriptor _socket;
  FileDescriptor _directory;
  std::string _name;
  dev_t _device;
  ino_t _inode;
};

/// An open port directory: a directory, of the effective user, without access for anybody else.
class PortDirectory {
 public:
  /// Opens the directory at the absolute `path`, making it (mode 0700, its parent must exist) when
  /// it is absent.
  [[nodiscard]] static Result<PortDirectory> openOrMake(const std::string& path);

  /// Opens the directory; without value when there is nothing at `path`.
  [[nodiscard]] static Result<std::optional<PortDirectory>> openExisting(const std::string& path);

  /// Takes the port name `name` and listens under it. A living owner keeps it; a dead one's file is
  /// replaced. Waits at most 1 s for somebody who is just taking a name.
  [[nodiscard]] Result<PortListener> listen(const std::string& name) const;

  /// Removes the sockets that nobody listens to any more, left behind by processes that were
  /// killed. Does nothing while somebody else keeps the lock.
  void removeDeadOwners() const;

  /// A non-blocking socket connected to the owner of the port name `name`; without value when
  /// nobody owns it. A symbolic link is no port.
  [[nodiscard]] Result<std::optional<FileDescriptor>> connect(const std::string& name) const;

 private:
  PortDirectory(FileDescriptor descriptor, std::string path)
      : _descriptor(std::move(descriptor)), _path(std::move(path)) {}

  [[nodiscard]] sockaddr_un address(const std::string& name) const;
  [[nodiscard]] Result<FileDescriptor> lock() const;
  [[nodiscard]] Result<void> removeDeadOwner(const std::string& name) const;

  FileDescriptor _descriptor;
  std::string _path;
};

}  // namespace kestro
