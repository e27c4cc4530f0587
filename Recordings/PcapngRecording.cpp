// SPDX-License-Identifier: MIT
#include "Recordings/PcapngRecording.h"

#include <fmt/format.h>

#include <utility>

#include "Recordings/OutputPath.h"
#include "Recordings/PcapFormat.h"

namespace kestro {
namespace {

Result<void> checkTechnology(const std::string& path, std::string_view technology) {
  if (linkTypeOfTechnology(technology)) return {};
  return failure(
      fmt::format("{}: \"{}\" is no technology to record", outputName(path), technology));
}

}  // namespace

Result<PcapngRecording> PcapngRecording::create(const std::string& path,
                                                std::string_view technology,
                                                std::string_view madeUp,
                                                const std::vector<std::string>& inputs) {
  if (auto checked = checkTechnology(path, technology); !checked) {
    return tl::unexpected(checked.error());
  }
  if (auto checked = checkOutputIsNoInput(path, inputs); !checked) {
    return tl::unexpected(checked.error());
  }
  auto writer = PcapngWriter::create(path, madeUp);
  if (!writer) return tl::unexpected(writer.error());
  return PcapngRecording(path, technology, *std::move(writer));
}

PcapngRecording::PcapngRecording(const std::string& path, std::string_view technology,
                                 PcapngWriter writer)
    : _files{path}, _technology(technology), _writer(std::move(writer)) {}

Result<void> PcapngRecording::setTechnology(std::string_view technology) {
  if (auto checked = checkTechnology(_files.front(), technology); !checked) return checked;
  _technology = technology;
  return {};
}

Result<void> PcapngRecording::setMadeUp(std::string_view madeUp) {
  return _writer.setMadeUp(madeUp);
}

bool PcapngRecording::addNote(std::string text) {
  if (_notes.size() == kMostNotes) return false;
  _notes.push_back(std::move(text));
  return true;
}

Result<void> PcapngRecording::write(Moment time, ByteView message) {
  if (message.size() > kMaximumPcapMessageSize) {
    countLeftOut();
    return {};
  }
  auto written = _writer.write({.time = time,
                                .technology = _technology,
                                .bytes = message,
                                .originalLength = message.size(),
                                .comments = _notes});
  if (!written) return written;
  countMessage();
  _notes.clear();
  return {};
}

Result<void> PcapngRecording::finish() {
  auto written = _writer.writeClosingNotes(_notes);
  _notes.clear();
  return written;
}

}  // namespace kestro
