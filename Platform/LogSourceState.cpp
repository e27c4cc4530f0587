// SPDX-License-Identifier: MIT
#include "Platform/LogSourceState.h"

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

}  // namespace

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
