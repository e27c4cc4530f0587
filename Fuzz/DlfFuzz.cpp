// SPDX-License-Identifier: MIT
// Bytes as a DLF log and as the history that it is to be a log of: what is read of it frames, and
// reads the same again.
#include <algorithm>
#include <vector>

#include "Fuzz/Harness.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Ondrel/OndrelLogGenerator.h"
#include "LogGenerator/Ondrel/Reframing.h"
#include "LogGenerator/Ondrel/VersionReport.h"

namespace kestro::fuzz {
namespace {

/// History entries with whatever the input holds as the packets between two refreshes.
Array historyOf(Input& input) {
  Array history;
  const std::size_t count = input.byte() % (kMaximumHistoryEntries + 1);
  for (std::size_t i = 0; i < count; ++i) {
    const ByteView collected = input.bytes(input.number16());
    history.append(
        Dictionary{{kStateDisplayState, Value::data({collected.begin(), collected.end()})}});
  }
  return history;
}

/// The log that is exported of a history.
Bytes exported(const Array& history) {
  Bytes log(kVersionReportSize, 0);
  for (const Value& entry : history) {
    const Value packets = entry.dictionary()[kStateDisplayState];
    const ByteView part = exportedPart(packets.bytes());
    log.insert(log.end(), part.begin(), part.end());
  }
  return log;
}

/// How many records a log has behind its version report, by their lengths.
std::size_t recordsIn(ByteView log) {
  std::size_t count = 0;
  ByteView rest = log.subspan(kVersionReportSize);
  for (; rest.size() >= 2; ++count) {
    const std::size_t length = rest[0] + std::size_t{256} * rest[1];
    require(length >= 12 && length <= rest.size(), "a record has a header and lies in its log");
    rest = rest.subspan(length);
  }
  require(rest.empty(), "a log is nothing but records");
  return count;
}

/// The log's records as messages again, as one history entry.
Array oneEntryOf(ByteView log) {
  Bytes collected;
  ByteView rest = log.subspan(kVersionReportSize);
  while (!rest.empty()) {
    const std::size_t length = rest[0] + std::size_t{256} * rest[1];
    collected.push_back(1);
    collected.insert(collected.end(), rest.begin(),
                     rest.begin() + static_cast<std::ptrdiff_t>(length));
    rest = rest.subspan(length);
  }
  return {Dictionary{{kStateDisplayState, Value::data(std::move(collected))}}};
}

void checkRoundTrip(const Array& history) {
  const auto read = reframedDlf(exported(history), history);
  require(read.has_value(), "a history's own log is its log");
  require(recordsIn(read->dlf) == read->packetCount, "every packet is one record");
  for (const auto& part : read->unframed) {
    require(part.entry >= 1 && part.entry <= history.size() && part.size > 0,
            "what does not frame is some of an entry");
  }
  const Array again = oneEntryOf(read->dlf);
  const auto reread = reframedDlf(exported(again), again);
  require(reread && reread->dlf == read->dlf, "a log that was read reads the same again");
  require(reread->unframed.empty(), "every record of a log that was read frames");
}

}  // namespace

void tryInput(ByteView bytes) {
  Input input(bytes);
  const Array history = historyOf(input);
  checkRoundTrip(history);
  const ByteView log = input.rest();
  const auto read = reframedDlf(log, history);
  if (read) {
    require(std::ranges::equal(log.subspan(kVersionReportSize),
                               ByteView(exported(history)).subspan(kVersionReportSize)),
            "a log is of no history but its own");
  }
  Bytes records;
  const CollectedRecords found = appendRecords(records, log);
  require(records.size() + found.unframedSize + found.count <= log.size(),
          "records are bytes of the log");
}

}  // namespace kestro::fuzz
