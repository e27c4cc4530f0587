// SPDX-License-Identifier: MIT
// What Wireshark is told of the interfaces that it can capture from.
#pragma once

#include <string>
#include <string_view>

namespace kestro {

/// The interfaces' names, as Wireshark gives them back.
inline constexpr std::string_view kChannelInterface = "kestro-channel";
inline constexpr std::string_view kSimulationInterface = "kestro-simulation";

/// The source of the simulation's interface, unless another is given.
inline constexpr std::string_view kSimulationSource = "simulation";

[[nodiscard]] bool isExtcapInterface(std::string_view name) noexcept;

/// The answers to Wireshark's questions, one sentence a line: which interfaces there are, which
/// link types one of them has, and which options.
[[nodiscard]] std::string interfacesAnswer(std::string_view version);
[[nodiscard]] std::string linkTypesAnswer();
[[nodiscard]] std::string optionsAnswer(std::string_view interfaceName);

}  // namespace kestro
