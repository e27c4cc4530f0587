// SPDX-License-Identifier: MIT
// Making the blocks of a pcapng file.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "Platform/Bytes.h"
#include "Recordings/RecordingReader.h"

namespace kestro {

/// Each of these appends one block to `blocks`, least significant bytes first. Texts that are
/// longer than an option can hold (65,535 bytes) become several.

/// Begins a section of unknown length. Interfaces count from 0 in it.
void appendPcapngSection(Bytes& blocks, std::span<const std::string> comments);

/// An interface whose times are microseconds.
void appendPcapngInterface(Bytes& blocks, std::uint16_t linkType, std::string_view name);

void appendPcapngPacket(Bytes& blocks, std::uint32_t interface, const RecordedMessage& message);

}  // namespace kestro
