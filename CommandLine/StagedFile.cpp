// SPDX-License-Identifier: MIT
#include "CommandLine/StagedFile.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <system_error>
#include <utility>

#include "Recordings/OutputPath.h"

namespace kestro {
namespace {

constexpr mode_t kNewFile = 0666;

tl::unexpected<Error> cannotCreate(const std::string& path) {
  return failure(fmt::format("{}: cannot create: {}", path, std::strerror(errno)));
}

}  // namespace

Result<StagedFile> StagedFile::create(const std::string& path) {
  if (auto checked = checkOutputCanBeCreated(path); !checked) {
    return tl::unexpected(checked.error());
  }
  StagedFile file(path);
  std::error_code error;
  const std::filesystem::file_status earlier = std::filesystem::status(path, error);
  const bool isStaged = path != kStandardOutputPath && (!std::filesystem::exists(earlier) ||
                                                        std::filesystem::is_regular_file(earlier));
  if (!isStaged) {
    file._writtenPath = path;
    return file;
  }
  // A link goes on leading to the file.
  file._target =
      std::filesystem::exists(earlier) ? std::filesystem::canonical(path, error).string() : path;
  if (auto staged = file.stage(); !staged) return tl::unexpected(staged.error());
  if (std::filesystem::exists(earlier)) {
    ::fchmod(file._descriptor,
             static_cast<mode_t>(earlier.permissions() & std::filesystem::perms::mask));
  }
  return file;
}

Result<void> StagedFile::stage() {
  const std::filesystem::path folder = std::filesystem::path(_target).parent_path() / ".";
  _descriptor = ::open(folder.c_str(), O_TMPFILE | O_RDWR | O_CLOEXEC, kNewFile);
  if (_descriptor >= 0) {
    _writtenPath = fmt::format("/proc/self/fd/{}", _descriptor);
    return {};
  }
  _part = fmt::format("{}.{}.part", _target, ::getpid());
  _descriptor = ::open(_part.c_str(), O_CREAT | O_EXCL | O_RDWR | O_CLOEXEC, kNewFile);
  if (_descriptor < 0) {
    _part.clear();
    return cannotCreate(_path);
  }
  _writtenPath = _part;
  return {};
}

StagedFile::StagedFile(StagedFile&& other) noexcept
    : _path(std::move(other._path)),
      _writtenPath(std::move(other._writtenPath)),
      _target(std::move(other._target)),
      _part(std::exchange(other._part, {})),
      _descriptor(std::exchange(other._descriptor, -1)) {}

StagedFile::~StagedFile() {
  if (_descriptor >= 0) ::close(_descriptor);
  if (!_part.empty()) ::unlink(_part.c_str());
}

Result<void> StagedFile::commit() {
  if (_target.empty()) return {};
  if (_part.empty()) {
    _part = fmt::format("{}.{}.part", _target, ::getpid());
    if (::linkat(AT_FDCWD, _writtenPath.c_str(), AT_FDCWD, _part.c_str(), AT_SYMLINK_FOLLOW) != 0) {
      _part.clear();
      return cannotCreate(_path);
    }
  }
  if (std::rename(_part.c_str(), _target.c_str()) != 0) return cannotCreate(_path);
  _part.clear();
  return {};
}

std::string StagedFile::named(std::string text) const {
  const auto found = _target.empty() ? std::string::npos : text.find(_writtenPath);
  if (found != std::string::npos) text.replace(found, _writtenPath.size(), _path);
  return text;
}

}  // namespace kestro
