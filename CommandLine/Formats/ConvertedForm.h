// SPDX-License-Identifier: MIT
// The forms that `convert` writes, one class a form.
#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "LogGenerator/GeneratorServices.h"
#include "Model/Replay.h"
#include "Platform/Result.h"
#include "Sources/InputMessage.h"

namespace kestro {

/// A recording of one form that is being written. Errors of `begin` and `write` are final.
class ConvertedForm {
 public:
  ConvertedForm() = default;
  virtual ~ConvertedForm() = default;
  ConvertedForm(const ConvertedForm&) = delete;
  ConvertedForm& operator=(const ConvertedForm&) = delete;

  /// Creates the file, before the first message; `technology` and `time` are the first message's,
  /// or what is known without one. The error says that the form cannot hold the technology, and
  /// which one can.
  [[nodiscard]] virtual Result<void> begin(std::string_view technology, Moment time) = 0;

  /// Why this message cannot be kept as it is; empty when it can.
  [[nodiscard]] virtual std::string problemOf(const InputMessage& message) const = 0;

  /// Appends a message that can be kept. The error says that the form cannot hold its technology
  /// beside the others, and which one can, or that the system refuses the bytes.
  [[nodiscard]] virtual Result<void> write(const InputMessage& message) = 0;

  /// Whether comments and what is made up are kept.
  [[nodiscard]] virtual bool keepsComments() const noexcept { return false; }

  /// Ends the file, with the notes that no message follows.
  [[nodiscard]] virtual Result<void> finish(std::span<const std::string> notes) = 0;
};

/// What a form is made with.
struct ConversionTarget {
  std::string path;            ///< where it is written
  GeneratorServices services;  ///< for the version report of a DLF log
  ReplayClock& clock;          ///< that of the services
};

struct ConversionForm {
  std::string_view name;
  std::string_view ending;  ///< of the files' names
  std::string_view help;
  std::unique_ptr<ConvertedForm> (*make)(const ConversionTarget& target);
};

/// All forms, the one for drives first.
[[nodiscard]] std::span<const ConversionForm> conversionForms();

/// The form of that name, or the one that a file's name ends in; null when there is none.
[[nodiscard]] const ConversionForm* conversionFormNamed(std::string_view name);
[[nodiscard]] const ConversionForm* conversionFormOfFile(std::string_view path);

}  // namespace kestro
