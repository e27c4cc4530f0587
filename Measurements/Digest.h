// SPDX-License-Identifier: MIT
// What tells recordings apart: SHA-256 of their bytes.
#pragma once

#include <memory>
#include <string>

#include "Platform/Bytes.h"
#include "Platform/Result.h"

namespace kestro {

/// Takes bytes piece by piece.
class Sha256 {
 public:
  Sha256();
  ~Sha256();
  Sha256(const Sha256&) = delete;
  Sha256& operator=(const Sha256&) = delete;

  void add(ByteView bytes);

  /// 64 lower-case hexadecimal digits, of all that was added. To be called once, at the end.
  [[nodiscard]] std::string finish();

 private:
  struct State;
  std::unique_ptr<State> _state;
};

/// Of a file's bytes. The error begins with the path.
[[nodiscard]] Result<std::string> sha256OfFile(const std::string& path);

}  // namespace kestro
