// SPDX-License-Identifier: MIT
// The layouts of all binary channels read once more, by hand and packet by packet, without a
// description and without what the program reads them with: what the generators are compared with.
#pragma once

#include <cstdint>
#include <memory>
#include <span>
#include <string_view>
#include <utility>
#include <vector>

#include "Fuzz/PlainReader/Packet.h"
#include "Platform/PropertyList.h"
#include "Platform/PropertyListCoding.h"

namespace kestro::plain {

/// What messages of one technology leave on its display.
class PlainReader {
 public:
  virtual ~PlainReader() = default;
  PlainReader(const PlainReader&) = delete;
  PlainReader& operator=(const PlainReader&) = delete;

  /// The template that makes a generator's display comparable with this reader's.
  [[nodiscard]] virtual Dictionary displayTemplate() const = 0;
  /// The log codes that say something, extra ones plus 0xFF0000.
  [[nodiscard]] virtual std::span<const std::uint32_t> codes() const = 0;

  /// Reads a message; false for one that ends the application.
  virtual bool receive(ByteView message) = 0;

  /// What the display shows now: changes with the next message.
  [[nodiscard]] const Dictionary& display() const { return _display; }
  /// The bytes kept for the log of the next snapshot; begins anew.
  [[nodiscard]] Bytes takeCollected() { return std::exchange(_collected, {}); }

 protected:
  PlainReader() = default;

  [[nodiscard]] Dictionary& shown() { return _display; }
  void collect(ByteView bytes) { _collected.insert(_collected.end(), bytes.begin(), bytes.end()); }

  /// The packet in a message, which may begin with a prefix of two bytes.
  [[nodiscard]] static Packet packetOf(ByteView message);
  /// The packet's log code.
  [[nodiscard]] static std::uint32_t codeOf(const Packet& packet);

 private:
  Dictionary _display;
  Bytes _collected;
};

/// The reader of a technology with sections, each a dictionary or a list.
class SectionReader : public PlainReader {
 public:
  [[nodiscard]] Dictionary displayTemplate() const override { return _template; }
  bool receive(ByteView message) override;

 protected:
  /// `coding` parses what extra packets carry.
  SectionReader(const PropertyListCoding& coding, std::span<const std::string_view> dictionaries,
                std::span<const std::string_view> lists);

  /// Reads a packet of one of the technology's own codes, or of any other.
  virtual void read(const Packet& packet, std::uint32_t code) = 0;

  [[nodiscard]] Dictionary section(std::string_view name) { return shown()[name].dictionary(); }
  /// Replaces a list's rows.
  void show(std::string_view name, std::vector<Value> rows) {
    shown()[name].array().assign(std::move(rows));
  }

  /// The cells of a cell-monitor packet that are dictionaries; nothing when it carries no array.
  [[nodiscard]] std::vector<Dictionary> cellsIn(const Packet& packet) const;

 private:
  bool readSimFiles(const Packet& packet);
  void readContexts(const Packet& packet);

  const PropertyListCoding& _coding;
  Dictionary _template;
};

/// Whether a cell is of a technology and a type, given without what their constants begin with:
/// ("LTE", "Serving").
[[nodiscard]] bool isCell(const Dictionary& cell, std::string_view technology,
                          std::string_view type);

/// Sets `key` to the cell's number, shown through a printf format; leaves it when there is none.
void showNumber(Dictionary& target, std::string_view key, const Dictionary& cell,
                std::string_view cellKey, const char* format = "%d", int factor = 1);

/// The same for a level: "" when it was not measured.
void showLevel(Dictionary& target, std::string_view key, const Dictionary& cell,
               std::string_view cellKey, const char* format, int factor = 1);

/// A value's name among the first values', else `other`.
[[nodiscard]] std::string_view nameOf(std::uint32_t value, std::span<const std::string_view> names,
                                      std::string_view other);

/// The reader of a technology; null for one without binary packets. `coding` must outlive it.
[[nodiscard]] std::unique_ptr<PlainReader> makePlainReader(std::string_view technology,
                                                           const PropertyListCoding& coding);

[[nodiscard]] std::unique_ptr<PlainReader> makeLTEReader(const PropertyListCoding& coding);
[[nodiscard]] std::unique_ptr<PlainReader> makeGsmUmtsReader(const PropertyListCoding& coding);
[[nodiscard]] std::unique_ptr<PlainReader> makeUTRANReader(const PropertyListCoding& coding);
[[nodiscard]] std::unique_ptr<PlainReader> makeC2KReader();

}  // namespace kestro::plain
