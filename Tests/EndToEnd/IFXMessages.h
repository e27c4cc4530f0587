// SPDX-License-Identifier: MIT
// Messages of the IFX channel, and captures of them.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

#include "Recordings/PcapWriter.h"

namespace kestro::testing {

/// 2012-03-04 12:05:09 UTC
inline constexpr Moment kCaptureStart{std::chrono::seconds(1'330'862'709)};

/// A message whose display is {"Count": count, "Cells": [{"ARFCN": "62", "RxLev": count}]}.
inline std::string ifxMessage(std::string_view count) {
  const std::string text(count);
  return "<plist version=\"1.0\"><dict>"
         "<key>Count</key><string>" +
         text +
         "</string>"
         "<key>Cells</key><array><string>header</string>"
         "<dict><key>ARFCN</key><string>62</string>"
         "<key>RxLev</key><string>" +
         text +
         "</string></dict></array>"
         "</dict></plist>";
}

/// The display of ifxMessage(count) as compact JSON.
inline std::string ifxDisplay(std::string_view count) {
  const std::string text(count);
  return R"({"Count":")" + text + R"(","Cells":[{"ARFCN":"62","RxLev":")" + text + R"("}]})";
}

/// Writes a capture whose messages stand `interval` apart.
inline void writeCapture(const std::string& path, const std::vector<std::string>& messages,
                         std::chrono::microseconds interval, std::string_view technology = "IFX") {
  auto writer = PcapWriter::create(path, technology);
  ASSERT_TRUE(writer);
  Moment time = kCaptureStart;
  for (const std::string& message : messages) {
    const Bytes bytes(message.begin(), message.end());
    ASSERT_TRUE(writer->write(time, bytes));
    time += interval;
  }
}

}  // namespace kestro::testing
