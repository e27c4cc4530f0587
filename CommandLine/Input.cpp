// SPDX-License-Identifier: MIT
#include "CommandLine/Input.h"

#include <fmt/format.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <memory>

namespace kestro {
namespace {

constexpr std::size_t kFirstChunk = std::size_t{64} * 1024;

struct Closer {
  void operator()(std::FILE* file) const noexcept { static_cast<void>(std::fclose(file)); }
};

Result<Bytes> systemFailure(const std::string& path) {
  return failure(fmt::format("{}: {}", path, std::strerror(errno)));
}

}  // namespace

Result<Bytes> readFile(const std::string& path, std::size_t longest) {
  const std::unique_ptr<std::FILE, Closer> file(std::fopen(path.c_str(), "rbe"));
  if (!file) return systemFailure(path);
  Bytes contents;
  std::size_t size = 0;
  do {  // each chunk as large as all before it, and one byte over the limit at the end
    contents.resize(std::min(std::max(2 * size, kFirstChunk), longest + 1));
    size += std::fread(contents.data() + size, 1, contents.size() - size, file.get());
    if (std::ferror(file.get()) != 0) return systemFailure(path);
  } while (size == contents.size() && size <= longest);
  if (size > longest) return failure(fmt::format("{}: more than {} bytes", path, longest));
  contents.resize(size);
  return contents;
}

}  // namespace kestro
