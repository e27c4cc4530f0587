// SPDX-License-Identifier: MIT
// What the reader and the writer of recorded captures share: link types and limits.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace kestro {

/// The longest message that a capture can hold: the record limit of the format's link types.
inline constexpr std::size_t kMaximumPcapMessageSize = 262'144;

/// The link type that stands for a technology in a capture's file header; absent for a name that is
/// none of the five technologies.
[[nodiscard]] std::optional<int> linkTypeOfTechnology(std::string_view technology) noexcept;

/// The technology that a link type stands for; absent when it stands for none. The text is a
/// constant.
[[nodiscard]] std::optional<std::string_view> technologyOfLinkType(int linkType) noexcept;

/// Why a recording of another link type is refused.
[[nodiscard]] std::string linkTypeRefusal(int linkType);

}  // namespace kestro
