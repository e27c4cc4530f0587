// SPDX-License-Identifier: MIT
#include "Platform/LogSourceState.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "Platform/TelephonyProtocol.h"

namespace kestro {
namespace {

std::optional<std::string> textIn(const Dictionary& body, std::string_view key) {
  const Value& value = body[key];
  if (!value.isText()) return std::nullopt;
  return std::string(value.text());
}

std::optional<bool> flagIn(const Dictionary& body, std::string_view key) {
  const Value& value = body[key];
  if (value.type() != ValueType::Boolean) return std::nullopt;
  return value.flag();
}

/// Names of kinds that are not what a person would say, and what is said when such a source ends.
struct KindWords {
  std::string_view kind;
  std::string_view ended;
};
constexpr std::array kKindWords = {
    KindWords{"capture", "the recording has ended"},
    KindWords{"recording", "the recording has ended"},
    KindWords{"drive-test", "the drive-test log has ended"},
    KindWords{"stream", "the stream has ended"},
};

/// No name on a screen is longer.
constexpr std::size_t kLongestName = 120;

/// The last part of a path; what is cut off does not end within a character.
std::string shortName(std::string_view path) {
  const auto slash = path.rfind('/');
  std::string_view name = slash == std::string_view::npos ? path : path.substr(slash + 1);
  if (name.size() <= kLongestName) return std::string(name);
  std::size_t end = kLongestName;
  while (end > 0 && (static_cast<unsigned char>(name[end]) & 0xC0U) == 0x80U) --end;
  return std::string(name.substr(0, end)) + "…";
}

}  // namespace

std::string sourceText(const LogSourceState& state) {
  std::string text = shortName(state.kind.value_or(""));
  if (state.name && *state.name != "-") {
    if (!text.empty()) text += ' ';
    text += shortName(*state.name);
  }
  if (!state.isSimulated.value_or(false) || text.starts_with("simulation")) return text;
  return text.empty() ? "simulated" : text + ", simulated";
}

std::string sourceEndedText(const LogSourceState& state) {
  const auto* words = std::ranges::find(kKindWords, state.kind.value_or(""), &KindWords::kind);
  return std::string(words == kKindWords.end() ? "the source has ended" : words->ended);
}

void addSourceState(const LogSourceState& state, Dictionary& body) {
  Dictionary source;
  if (state.kind) source.set(kTelephonySourceKind, *state.kind);
  if (state.name) source.set(kTelephonySourceName, *state.name);
  if (state.kind || state.name) body.set(kTelephonySource, source);
  if (state.isSimulated) body.set(kTelephonySimulated, Value::boolean(*state.isSimulated));
  if (state.hasEnded) body.set(kTelephonyEnded, Value::boolean(*state.hasEnded));
}

LogSourceState sourceStateIn(const Dictionary& body) {
  const Dictionary source = body[kTelephonySource].dictionary();
  return {.kind = textIn(source, kTelephonySourceKind),
          .name = textIn(source, kTelephonySourceName),
          .isSimulated = flagIn(body, kTelephonySimulated),
          .hasEnded = flagIn(body, kTelephonyEnded)};
}

}  // namespace kestro
