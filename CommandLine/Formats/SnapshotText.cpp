// SPDX-License-Identifier: MIT
#include "CommandLine/Formats/SnapshotText.h"

#include <fmt/format.h>

#include <algorithm>
#include <functional>
#include <memory>
#include <utility>
#include <vector>

#include "CommandLine/Formats/DisplayFormats.h"
#include "LogGenerator/LogGenerator.h"
#include "LogGenerator/Ondrel/Reframing.h"
#include "Model/Snapshot.h"
#include "Recordings/SnapshotFile.h"

namespace kestro {
namespace {

using Nodes = std::vector<NodePointer>;

NodePointer leaf(std::string_view name, std::string value) {
  return std::make_shared<KestroModelLeafNode>(std::string(name), std::move(value));
}

NodePointer treeOf(const Value& object) {
  NodesByPath nodesByPath;
  return KestroModelNode::makeTreeFromObjectWithPathDictionary(object, nodesByPath);
}

/// The value's text as a display shows it, "(unknown)" when it is none.
std::string leafText(const Value& value) {
  return value.isText() ? std::string(value.text()) : "(unknown)";
}

bool isDlf(const Value& entry) { return entry.dictionary()[kSnapshotDlf].isData(); }

/// How many packets were collected, as far as their bytes tell.
std::string packetsText(ByteView collected) {
  Bytes records;
  const CollectedRecords found = appendRecords(records, collected);
  if (found.unframedSize != 0) return fmt::format("{} bytes", collected.size());
  return fmt::format("{} ({} bytes)", found.count, collected.size());
}

NodePointer entryNode(const Value& entry) {
  const Dictionary dictionary = entry.dictionary();
  Nodes children;
  if (const Value& packets = dictionary[kStateDisplayState]; packets.isData()) {
    children.push_back(leaf("Packets", packetsText(packets.bytes())));
  }
  if (const Value& display = dictionary[kStateDisplay]; !display.isNull()) {
    const NodePointer tree = treeOf(display);
    if (const Nodes* nodes = tree->childNodes()) {
      children.insert(children.end(), nodes->begin(), nodes->end());
    } else {
      children.push_back(leaf(kStateDisplay, *tree->value()));
    }
  }
  const std::string description = entryDescription(entry);
  return std::make_shared<KestroModelTreeNode>(
      description.empty() ? "(no description)" : description, std::move(children));
}

/// What stands above the entries.
Nodes headNodes(const Dictionary& snapshot) {
  Nodes nodes;
  for (const std::string_view key : {kSnapshotTimestamp, kSnapshotDescription}) {
    const Value& value = snapshot[key];
    if (!value.isNull()) nodes.push_back(leaf(key, leafText(value)));
  }
  const Value& data = snapshot[kSnapshotData];
  if (data.isNull()) return nodes;
  const auto count = std::ranges::count_if(data.array(), std::not_fn(isDlf));
  nodes.push_back(leaf("History", fmt::format("{} {}", count, count == 1 ? "entry" : "entries")));
  if (const Value dlf = dlfOfSnapshot(snapshot); !dlf.isNull()) {
    nodes.push_back(leaf("DLF log", fmt::format("{} bytes", dlf.bytes().size())));
  }
  return nodes;
}

std::string plainText(Nodes children) {
  std::string text;
  appendPlainTree(text, KestroModelTreeNode("Kestro", std::move(children)));
  return text;
}

}  // namespace

void writeSnapshotText(const Dictionary& snapshot,
                       const std::function<void(std::string_view)>& write) {
  write(plainText(headNodes(snapshot)));
  for (const Value& entry : snapshot[kSnapshotData].array()) {
    if (!isDlf(entry)) write("\n" + plainText({entryNode(entry)}));
  }
}

}  // namespace kestro
