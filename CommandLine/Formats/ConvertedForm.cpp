// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/ConvertedForm.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <optional>
#include <utility>

#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "LogGenerator/Ondrel/Reframing.h"
#include "Recordings/OutputFile.h"
#include "Recordings/PcapFormat.h"
#include "Recordings/PcapWriter.h"
#include "Recordings/PcapngWriter.h"

namespace kestro {
namespace {

std::string lengthProblem(const InputMessage& message) {
  if (message.bytes.size() <= kMaximumPcapMessageSize) return "";
  return fmt::format("{} bytes are more than a recording holds ({})", message.bytes.size(),
                     kMaximumPcapMessageSize);
}

std::string cutProblem(const InputMessage& message) {
  if (!message.isCut()) return "";
  return fmt::format("only {} of its {} bytes were recorded", message.bytes.size(),
                     message.originalLength);
}

tl::unexpected<Error> severalTechnologies(std::string_view form, const InputMessage& message,
                                          std::string_view first) {
  return failure(
      fmt::format("{} holds one technology, and message {} is {} behind {}: --technology "
                  "narrows to one, and pcapng holds several",
                  form, message.number, message.technology, first));
}

class PcapngForm final : public ConvertedForm {
 public:
  explicit PcapngForm(const ConversionTarget& target) : _path(target.path) {}

  [[nodiscard]] Result<void> begin(std::string_view /*technology*/, Moment /*time*/) override {
    auto writer = PcapngWriter::create(_path);
    if (!writer) return tl::unexpected(writer.error());
    _writer.emplace(*std::move(writer));
    return {};
  }
  [[nodiscard]] std::string problemOf(const InputMessage& message) const override {
    return lengthProblem(message);
  }
  [[nodiscard]] Result<void> write(const InputMessage& message) override {
    if (auto marked = _writer->setMadeUp(message.madeUp); !marked) return marked;
    return _writer->write({.time = message.time,
                           .technology = message.technology,
                           .bytes = message.bytes,
                           .originalLength = message.originalLength,
                           .comments = message.comments});
  }
  [[nodiscard]] bool keepsComments() const noexcept override { return true; }
  [[nodiscard]] Result<void> finish(std::span<const std::string> notes) override {
    return _writer->writeClosingNotes(notes);
  }

 private:
  std::string _path;
  std::optional<PcapngWriter> _writer;
};

class PcapForm final : public ConvertedForm {
 public:
  explicit PcapForm(const ConversionTarget& target) : _path(target.path) {}

  [[nodiscard]] Result<void> begin(std::string_view technology, Moment /*time*/) override {
    _technology = technology;
    auto writer = PcapWriter::create(_path, technology);
    if (!writer) return tl::unexpected(writer.error());
    _writer.emplace(*std::move(writer));
    return {};
  }
  [[nodiscard]] std::string problemOf(const InputMessage& message) const override {
    const auto cut = cutProblem(message);
    return cut.empty() ? lengthProblem(message) : cut;
  }
  [[nodiscard]] Result<void> write(const InputMessage& message) override {
    if (message.technology != _technology) {
      return severalTechnologies("pcap", message, _technology);
    }
    return _writer->write(message.time, message.bytes);
  }
  [[nodiscard]] Result<void> finish(std::span<const std::string> /*notes*/) override { return {}; }

 private:
  std::string _path;
  std::string _technology;
  std::optional<PcapWriter> _writer;
};

/// The reframed form: a version report, then a record a packet.
class DlfForm final : public ConvertedForm {
 public:
  explicit DlfForm(const ConversionTarget& target) : _target(target) {}

  [[nodiscard]] Result<void> begin(std::string_view technology, Moment time) override {
    _technology = technology;
    _target.clock.setNow(time);
    const auto generator = LogGenerator::generatorFromTechnology(_target.services, technology);
    auto* packets = dynamic_cast<OndrelLogGenerator*>(generator.get());
    if (packets == nullptr) {
      return failure(fmt::format(
          "a DLF log holds packets, and the messages of {} are property lists: pcapng and pcap "
          "hold them",
          technology));
    }
    const auto report = packets->generateDlfFromState(Dictionary());
    auto file = OutputFile::create(_target.path);
    if (!file) return tl::unexpected(file.error());
    _file.emplace(*std::move(file));
    return report ? _file->write(*report) : Result<void>();
  }
  [[nodiscard]] std::string problemOf(const InputMessage& message) const override {
    if (auto cut = cutProblem(message); !cut.empty()) return cut;
    Bytes record;
    const auto records = appendRecords(record, message.bytes);
    return records.count == 1 && records.unframedSize == 0 ? "" : "it is no packet";
  }
  [[nodiscard]] Result<void> write(const InputMessage& message) override {
    if (message.technology != _technology) {
      return severalTechnologies("a DLF log", message, _technology);
    }
    _record.clear();
    appendRecords(_record, message.bytes);
    return _file->write(_record);
  }
  [[nodiscard]] Result<void> finish(std::span<const std::string> /*notes*/) override { return {}; }

 private:
  ConversionTarget _target;
  std::string _technology;
  std::optional<OutputFile> _file;
  Bytes _record;
};

template <class Form>
std::unique_ptr<ConvertedForm> makeForm(const ConversionTarget& target) {
  return std::make_unique<Form>(target);
}

constexpr std::array kForms = {
    ConversionForm{"pcapng", ".pcapng", "everything: all technologies, notes and positions",
                   makeForm<PcapngForm>},
    ConversionForm{"pcap", ".pcap", "messages of one technology", makeForm<PcapForm>},
    ConversionForm{"dlf", ".dlf",
                   "packets of one technology, as records of a diagnostic log with their own times",
                   makeForm<DlfForm>},
};

}  // namespace

std::span<const ConversionForm> conversionForms() { return kForms; }

const ConversionForm* conversionFormNamed(std::string_view name) {
  const auto* found = std::ranges::find(kForms, name, &ConversionForm::name);
  return found == kForms.end() ? nullptr : found;
}

const ConversionForm* conversionFormOfFile(std::string_view path) {
  const auto* found = std::ranges::find_if(
      kForms, [path](const ConversionForm& form) { return path.ends_with(form.ending); });
  return found == kForms.end() ? nullptr : found;
}

}  // namespace kestro
