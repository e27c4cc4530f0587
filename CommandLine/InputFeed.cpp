// SPDX-License-Identifier: MIT
#include "CommandLine/InputFeed.h"

#include <fmt/format.h>

#include <algorithm>
#include <memory>
#include <optional>

#include "CommandLine/Output.h"

namespace kestro {
namespace {

/// What is wrong with requests that each for itself are right.
std::optional<std::string> usageProblem(const std::vector<SourceRequest>& requests,
                                        const InputNarrowing& narrowing) {
  const auto isEndless = [](const SourceRequest& request) {
    const auto* kind = sourceKindNamed(request.kind);
    return kind != nullptr && kind->isEndless;
  };
  if (narrowing.to || std::ranges::none_of(requests, isEndless)) return std::nullopt;
  return "a simulation has no end: --to must say where to stop, for instance --to=+60s";
}

}  // namespace

tl::expected<InputFeed, ExitStatus> InputFeed::open(const InputOptions& options,
                                                    bool printsResults) {
  const auto requests = requestsOf(options);
  const auto narrowing = narrowingOf(options);
  if (const auto problem = usageProblem(requests, narrowing)) {
    complain(*problem);
    return tl::unexpected(kExitWrongUsage);
  }
  auto services = std::make_unique<OfflineServices>();
  auto inputs = Inputs::open(requests, narrowing, services->forSources(), complain);
  if (!inputs) {
    complain(inputs.error().message);
    return tl::unexpected(kExitNothingDone);
  }
  return InputFeed(std::move(services), *std::move(inputs), printsResults);
}

bool InputFeed::hasSeveralTechnologies(const InputOptions& options) const {
  return _inputs.mayHaveSeveralTechnologies() &&
         haveSeveralTechnologies(requestsOf(options), narrowingOf(options),
                                 _services->forSources());
}

bool InputFeed::takeNext(const Handler& take) {
  _progress.step([this] { return _inputs.fractionRead(); });
  const auto next = _inputs.next();
  if (!next) {
    _progress.erase();
    complain(next.error().message);
    _damage.push_back(next.error().message);
    return true;
  }
  if (!*next) {
    _progress.erase();
    return false;
  }
  ++_wantedCount;
  const InputMessage& message = **next;
  if (message.isCut() && !_takeCut) {
    skip(message, fmt::format("only {} of its {} bytes were recorded", message.bytes.size(),
                              message.originalLength));
  } else if (const auto outcome = message.isCut() ? _takeCut(message) : take(message); !outcome) {
    skip(message, outcome.error().message);
  }
  return true;
}

ExitStatus InputFeed::status() const noexcept {
  const bool isDamaged = !_damage.empty();
  if (isDamaged && messageCount() == 0) return kExitNothingDone;
  return isDamaged || _hasSkipped ? kExitPartlyDone : kExitDone;
}

void InputFeed::skip(const InputMessage& message, const std::string& reason) {
  _progress.erase();
  complain(
      fmt::format("{}: message {}: {}", _inputs.nameOf(message.input), message.number, reason));
  _hasSkipped = true;
}

}  // namespace kestro
