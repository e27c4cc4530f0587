// SPDX-License-Identifier: MIT
// Reading the blocks of a pcapng file.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Platform/Result.h"
#include "Recordings/PcapngFormat.h"
#include "Recordings/RecordedFile.h"

namespace kestro {

/// Bytes of a block with the byte order of its section. What is read past their end is 0.
class PcapngBytes {
 public:
  PcapngBytes() = default;
  PcapngBytes(ByteView bytes, bool isBigEndian) : _bytes(bytes), _isBigEndian(isBigEndian) {}

  [[nodiscard]] ByteView view() const noexcept { return _bytes; }
  [[nodiscard]] std::size_t size() const noexcept { return _bytes.size(); }
  [[nodiscard]] std::uint16_t u16(std::size_t offset) const noexcept {
    return load<std::uint16_t>(offset);
  }
  [[nodiscard]] std::uint32_t u32(std::size_t offset) const noexcept {
    return load<std::uint32_t>(offset);
  }
  [[nodiscard]] std::uint64_t u64(std::size_t offset) const noexcept {
    return load<std::uint64_t>(offset);
  }
  /// The bytes from `offset` on; `offset` and `count` lie inside.
  [[nodiscard]] PcapngBytes from(std::size_t offset) const noexcept {
    return {_bytes.subspan(offset), _isBigEndian};
  }
  [[nodiscard]] PcapngBytes part(std::size_t offset, std::size_t count) const noexcept {
    return {_bytes.subspan(offset, count), _isBigEndian};
  }

 private:
  template <class T>
  [[nodiscard]] T load(std::size_t offset) const noexcept {
    return _isBigEndian ? loadBigEndian<T>(_bytes, offset) : loadLittleEndian<T>(_bytes, offset);
  }

  ByteView _bytes;
  bool _isBigEndian = false;
};

struct PcapngBlock {
  PcapngBlockType type;
  PcapngBytes body;
};

/// Yields a file's blocks in order. Both lengths of each have been compared.
class PcapngBlocks {
 public:
  explicit PcapngBlocks(RecordedFile file) : _file(std::move(file)) {}

  [[nodiscard]] const RecordedFile& file() const noexcept { return _file; }

  /// The next block whose type is one of PcapngBlockType, valid until the next call; nothing at the
  /// end of the file. Others are passed over.
  [[nodiscard]] Result<std::optional<PcapngBlock>> next();

  /// The error that the block yielded last, or the one that is being read, is damaged.
  [[nodiscard]] tl::unexpected<Error> damaged(std::string_view reason) const;

 private:
  struct Head;

  [[nodiscard]] Result<std::optional<Head>> nextHead();
  [[nodiscard]] Result<PcapngBlock> read(const Head& head);
  [[nodiscard]] Result<void> passOver(const Head& head);
  [[nodiscard]] Result<void> checkTail(const Head& head, ByteView tail) const;
  [[nodiscard]] tl::unexpected<Error> cut(std::uint64_t length, std::uint64_t present) const;

  RecordedFile _file;
  std::uint64_t _offset = 0;  ///< where the current block begins
  bool _isBigEndian = false;  ///< the section that it belongs to
};

}  // namespace kestro
