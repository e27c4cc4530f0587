// SPDX-License-Identifier: MIT
#include "Model/LastWords.h"

#include <cstdlib>
#include <exception>
#include <string>
#include <utility>

#include "Model/FailureText.h"

namespace kestro {
namespace {

std::function<void(std::string_view)> lastHandler;
std::terminate_handler handlerBefore = nullptr;

[[noreturn]] void sayLastWords() {
  // Taken out first: a failure of the handler itself comes here again, and finds none.
  if (const auto handler = std::exchange(lastHandler, nullptr)) {
    handler("ended by a failure: " + failureText(std::current_exception()));
  }
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
