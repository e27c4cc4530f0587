// SPDX-License-Identifier: MIT
#include "Measurements/Digest.h"

#include <fmt/format.h>
#include <sha2.h>
#include <sys/types.h>

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>

namespace kestro {

struct Sha256::State {
  SHA2_CTX context{};
};

Sha256::Sha256() : _state(std::make_unique<State>()) { SHA256Init(&_state->context); }
Sha256::~Sha256() = default;

void Sha256::add(ByteView bytes) { SHA256Update(&_state->context, bytes.data(), bytes.size()); }

std::string Sha256::finish() {
  std::array<std::uint8_t, SHA256_DIGEST_LENGTH> digest{};
  SHA256Final(digest.data(), &_state->context);
  return fmt::format("{:02x}", fmt::join(digest, ""));
}

Result<std::string> sha256OfFile(const std::string& path) {
  const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(path.c_str(), "rbe"),
                                                             std::fclose);
  if (!file) return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  Sha256 digest;
  std::array<std::uint8_t, 1U << 16U> buffer{};
  while (const std::size_t count = std::fread(buffer.data(), 1, buffer.size(), file.get())) {
    digest.add(ByteView(buffer).first(count));
  }
  if (std::ferror(file.get()) != 0) {
    return failure(fmt::format("{}: {}", path, std::strerror(errno)));
  }
  return digest.finish();
}

}  // namespace kestro
