// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/Explanation.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "CommandLine/Formats/LayoutText.h"
#include "LogGenerator/Packets/PacketHeader.h"

namespace kestro {

Explanation::Explanation(const ExplainOptions& options, InputFeed feed)
    : _options(options), _feed(std::move(feed)), _services(std::nullopt, options.shownLog) {}

int Explanation::run() {
  const bool hasSeveral = _feed.hasSeveralTechnologies(_options.inputs);
  if (!hasSeveral && !_options.isList) {
    const auto* only = technologyNamed(_feed.technology());
    if (only != nullptr && only->names.isEmpty()) return nothingDone(onlyPropertyLists());
  }
  _writer = std::ranges::find(explainFormats(), _options.format, &ExplainFormat::name)
                ->makeWriter(_output, {.hasTechnology = hasSeveral, .isList = _options.isList});
  const auto take = [this](const InputMessage& message) { return explain(message); };
  while (goesOn() && _feed.takeNext(take)) {
  }
  return finish();
}

Explanation::Technology* Explanation::technologyNamed(std::string_view name) {
  const auto known = _technologies.find(name);
  if (known != _technologies.end()) return &known->second;
  auto generator = LogGenerator::generatorFromTechnology(_services.forGenerator(), name);
  if (!generator) return nullptr;
  PacketNames names(*generator);
  return &_technologies.emplace(name, Technology{std::move(generator), std::move(names)})
              .first->second;
}

bool Explanation::goesOn() const {
  if (!_output.failureMessage().empty()) return false;
  return !_options.messages || _feed.messageCount() < _options.messages->last;
}

Result<void> Explanation::explain(const InputMessage& message) {
  if (_options.messages && !_options.messages->contains(message.number)) return {};
  const auto* technology = technologyNamed(message.technology);
  if (technology == nullptr) {
    return failure(fmt::format("nothing here decodes the technology {}", message.technology));
  }
  const bool isPropertyList = technology->names.isEmpty();
  _hasPropertyLists = _hasPropertyLists || isPropertyList;
  if (!isPropertyList || _options.isList) write(headOf(message, *technology), message, *technology);
  return {};
}

PacketHead Explanation::headOf(const InputMessage& message, const Technology& technology) const {
  PacketHead head{.message = message.number,
                  .time = message.time,
                  .technology = message.technology,
                  .packet = message.bytes};
  if (technology.names.isEmpty()) return head;
  head.packet = packetOfMessage(message.bytes);
  head.prefixLength = message.bytes.size() - head.packet.size();
  if (message.bytes.size() >= kPacketHeaderSize) {
    head.code = logCodeOf(PacketView(head.packet));
    head.name = technology.names.nameOf(*head.code);
  }
  return head;
}

void Explanation::write(const PacketHead& head, const InputMessage& message,
                        const Technology& technology) {
  begin();
  _writer->beginPacket(head);
  if (_options.isList) return _writer->endPacket("");
  bool hasValues = false;
  technology.generator->explainMessage(message.bytes, [&](const ExplainedValue& value) {
    hasValues = true;
    _writer->value(value);
  });
  _writer->endPacket(hasValues ? "" : technology.names.reasonForNothing(message.bytes));
}

/// Before the first packet: what finds none writes nothing.
void Explanation::begin() {
  if (!_hasBegun) _writer->begin(_feed.technology());
  _hasBegun = true;
}

bool Explanation::isNarrowed() const {
  const auto& narrowing = _options.inputs.narrowing;
  return _options.messages || narrowing.code || narrowing.from || narrowing.to ||
         !_options.inputs.technology.empty();
}

int Explanation::finish() {
  if (_feed.status() == kExitNothingDone) return kExitNothingDone;
  if (!_hasBegun && _output.failureMessage().empty()) {
    if (_hasPropertyLists) return nothingDone(onlyPropertyLists());
    if (isNarrowed()) return nothingDone(nothingFound());
  }
  begin();
  _writer->finish();
  _output.flush();
  if (!_output.failureMessage().empty()) return nothingDone(_output.failureMessage());
  return _feed.status();
}

std::string Explanation::onlyPropertyLists() const {
  return fmt::format(
      "{}: the messages of {} are property lists, not packets; there is nothing to explain",
      _feed.name(), _feed.technology());
}

std::string Explanation::nothingFound() const {
  const auto& narrowing = _options.inputs.narrowing;
  std::string what = "no message";
  if (const auto& numbers = _options.messages) {
    what += fmt::format(" {}", numbers->first);
    if (numbers->last != numbers->first) what += fmt::format(" to {}", numbers->last);
  }
  if (narrowing.code) what += fmt::format(" of log code {}", logCodeText(*narrowing.code));
  if (const auto& name = _options.inputs.technology; !name.empty()) what += " of " + name;
  if (narrowing.from || narrowing.to) what += " between these times";
  return fmt::format("{}: there is {}", _feed.name(), what);
}

}  // namespace kestro
