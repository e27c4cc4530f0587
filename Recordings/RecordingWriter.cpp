// SPDX-License-Identifier: MIT
#include "Recordings/RecordingWriter.h"

#include <utility>

#include "Recordings/PcapRecording.h"
#include "Recordings/PcapngRecording.h"

namespace kestro {
namespace {

constexpr std::string_view kPcapEnding = ".pcap";

template <class Recording>
Result<std::unique_ptr<RecordingWriter>> asWriter(Result<Recording> recording) {
  if (!recording) return tl::unexpected(recording.error());
  return std::make_unique<Recording>(*std::move(recording));
}

}  // namespace

Result<std::unique_ptr<RecordingWriter>> createRecording(const std::string& path,
                                                         std::string_view technology,
                                                         std::string_view madeUp,
                                                         const std::vector<std::string>& inputs) {
  if (path.ends_with(kPcapEnding)) return asWriter(PcapRecording::create(path, technology, inputs));
  return asWriter(PcapngRecording::create(path, technology, madeUp, inputs));
}

}  // namespace kestro
