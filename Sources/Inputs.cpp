// SPDX-License-Identifier: MIT
#include "Sources/Inputs.h"

#include <fmt/format.h>

#include <algorithm>
#include <filesystem>
#include <functional>
#include <system_error>
#include <utility>

#include "LogGenerator/Packets/PacketHeader.h"
#include "Platform/TelephonyService.h"

namespace kestro {
namespace {

bool isStandardInput(const SourceRequest& request) {
  return request.argument == RecordedFile::kStandardInput;
}

std::optional<std::uint64_t> numberOf(const std::optional<InputBound>& bound) {
  const auto* number = bound ? std::get_if<MessageNumber>(&*bound) : nullptr;
  return number == nullptr ? std::nullopt : std::optional(number->number);
}

std::optional<Moment> timeOf(const std::optional<InputBound>& bound, Moment first) {
  if (!bound) return std::nullopt;
  if (const auto* moment = std::get_if<Moment>(&*bound)) return *moment;
  if (const auto* after = std::get_if<std::chrono::microseconds>(&*bound)) return first + *after;
  return std::nullopt;
}

bool isOfCode(const InputMessage& message, LogCode code) {
  if (message.technology == kTqLogChannelTechnology_IFX) return false;
  const PacketView packet(packetOfMessage(message.bytes));
  return packet.size() >= kPacketHeaderSize && logCodeOf(packet) == code;
}

std::string nameOfInput(const SourceRequest& request) {
  const auto* kind = sourceKindNamed(request.kind);
  const bool isFile = kind == nullptr || !kind->isEndless;
  return isFile ? request.argument : fmt::format("{}:{}", request.kind, request.argument);
}

/// Whether a second reader would find the same.
bool canBeReadTwice(const SourceRequest& request) {
  const auto* kind = sourceKindNamed(request.kind);
  std::error_code error;
  return (kind != nullptr && kind->isEndless) ||
         std::filesystem::is_regular_file(request.argument, error);
}

}  // namespace

Result<Inputs> Inputs::open(std::span<const SourceRequest> requests,
                            const InputNarrowing& narrowing, const SourceServices& services,
                            const SourceReporter& report) {
  if (std::ranges::count_if(requests, isStandardInput) > 1) {
    return failure("standard input cannot be read twice");
  }
  Inputs inputs(narrowing);
  for (const SourceRequest& request : requests) {
    auto reader = openInput(request, services, report);
    if (!reader) return tl::unexpected(reader.error());
    inputs._unread.insert(inputs._unread.begin(), inputs._inputs.size());
    inputs._inputs.push_back({.name = nameOfInput(request), .reader = *std::move(reader)});
  }
  return inputs;
}

Result<std::optional<InputMessage>> Inputs::next() {
  while (!isPastEnd()) {
    while (!_unread.empty()) {
      const std::size_t index = _unread.back();
      _unread.pop_back();
      if (auto filled = fill(index); !filled) return tl::unexpected(filled.error());
    }
    const auto message = takeEarliest();
    if (!message) break;
    if (isWanted(*message)) return message;
  }
  return std::nullopt;
}

Result<void> Inputs::fill(std::size_t index) {
  Input& input = _inputs[index];
  auto message = input.reader->next();
  if (!message || !message->has_value()) {
    input.hasEnded = true;
    if (!message) return tl::unexpected(message.error());
    return {};
  }
  input.head = **message;
  input.head->input = index;
  _places.emplace_back(input.head->time, index);
  std::ranges::push_heap(_places, std::greater());
  return {};
}

std::optional<InputMessage> Inputs::takeEarliest() {
  if (_places.empty()) return std::nullopt;
  std::ranges::pop_heap(_places, std::greater());
  Input& input = _inputs[_places.back().second];
  _places.pop_back();
  InputMessage message = *input.head;
  message.number = ++_count;
  if (_count == 1) begin(message.time);
  _last = message.time;
  _technology = message.technology;
  // Nothing that is wanted follows where times only go up.
  input.hasEnded = _to && message.time >= *_to && input.reader->timesGoUp();
  if (!input.hasEnded) _unread.push_back(message.input);
  return message;
}

void Inputs::begin(Moment first) {
  _first = first;
  _from = timeOf(_narrowing.from, first);
  _to = timeOf(_narrowing.to, first);
}

bool Inputs::isPastEnd() const noexcept {
  const auto last = numberOf(_narrowing.to);
  return last && _count >= *last;
}

bool Inputs::isWanted(const InputMessage& message) const {
  if (_from && message.time < *_from) return false;
  if (_to && message.time >= *_to) return false;
  if (message.number < numberOf(_narrowing.from).value_or(0)) return false;
  if (!_narrowing.technology.empty() && message.technology != _narrowing.technology) return false;
  return !_narrowing.code || isOfCode(message, *_narrowing.code);
}

std::string_view Inputs::technology() const noexcept {
  if (!_technology.empty() || _inputs.empty()) return _technology;
  return _inputs.front().reader->technology();
}

std::optional<double> Inputs::fractionRead() const noexcept {
  if (_inputs.empty()) return std::nullopt;
  const double end = shareOfEnd();
  double sum = 0;
  for (const Input& input : _inputs) {
    const auto read = input.hasEnded ? 1.0 : input.reader->fractionRead();
    if (!read && end == 0) return std::nullopt;
    sum += std::max(read.value_or(end), end);
  }
  return sum / static_cast<double>(_inputs.size());
}

/// How much of the way to the end that was asked for lies behind; 0 without one.
double Inputs::shareOfEnd() const noexcept {
  using Seconds = std::chrono::duration<double>;
  double share = 0;
  if (const auto last = numberOf(_narrowing.to)) {
    share = static_cast<double>(_count) / static_cast<double>(*last);
  } else if (_to && *_to > _first) {
    share = Seconds(_last - _first) / Seconds(*_to - _first);
  }
  return std::clamp(share, 0.0, 1.0);
}

bool Inputs::mayHaveSeveralTechnologies() const noexcept {
  if (!_narrowing.technology.empty()) return false;
  return std::ranges::any_of(_inputs, [this](const Input& input) {
    return input.reader->mayChangeTechnology() ||
           input.reader->technology() != _inputs.front().reader->technology();
  });
}

bool haveSeveralTechnologies(std::span<const SourceRequest> requests,
                             const InputNarrowing& narrowing, const SourceServices& services) {
  if (!narrowing.technology.empty()) return false;
  if (!std::ranges::all_of(requests, canBeReadTwice)) return true;
  auto inputs = Inputs::open(requests, narrowing, services, [](std::string_view) {});
  if (!inputs) return false;
  if (!inputs->mayHaveSeveralTechnologies()) return false;
  std::string_view technology;
  while (true) {
    const auto message = inputs->next();
    if (!message) continue;
    if (!message->has_value()) return false;
    if (!technology.empty() && (*message)->technology != technology) return true;
    technology = (*message)->technology;
  }
}

}  // namespace kestro
