// SPDX-License-Identifier: MIT
#include "CommandLine/LastWords.h"

#include <cstdlib>
#include <exception>
#include <string>
#include <utility>

#include "CommandLine/FullScreen.h"
#include "CommandLine/Output.h"
#include "Model/FailureText.h"

namespace kestro {
namespace {

std::function<void(std::string_view)> lastHandler;
std::terminate_handler handlerBefore = nullptr;

[[noreturn]] void sayLastWords() {
  FullScreen::restore();
  const std::string line = "ended by a failure: " + failureText(std::current_exception());
  complain(line);
  if (const auto handler = std::exchange(lastHandler, nullptr)) handler(line);
  std::abort();
}

}  // namespace

LastWords::LastWords(std::function<void(std::string_view line)> handler) {
  lastHandler = std::move(handler);
  handlerBefore = std::set_terminate(sayLastWords);
}

LastWords::~LastWords() {
  std::set_terminate(handlerBefore);
  lastHandler = nullptr;
}

}  // namespace kestro
