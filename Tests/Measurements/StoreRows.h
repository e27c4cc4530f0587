// SPDX-License-Identifier: MIT
// What a query on a SQLite file yields, for tests.
#pragma once

#include <sqlite3.h>

#include <string>
#include <vector>

namespace kestro::testing {

/// The rows, their columns with "|" between them; a query that fails yields its error as a row.
inline std::vector<std::string> rowsOf(const std::string& path, const std::string& query) {
  sqlite3* handle = nullptr;
  std::vector<std::string> rows;
  const auto keep = [](void* into, int count, char** texts, char**) {
    std::string row;
    for (int i = 0; i < count; ++i) {
      if (i > 0) row += "|";
      row += texts[i] == nullptr ? "" : texts[i];
    }
    static_cast<std::vector<std::string>*>(into)->push_back(row);
    return 0;
  };
  sqlite3_open_v2(path.c_str(), &handle, SQLITE_OPEN_READWRITE, nullptr);
  if (sqlite3_exec(handle, query.c_str(), keep, &rows, nullptr) != SQLITE_OK) {
    rows = {sqlite3_errmsg(handle)};
  }
  sqlite3_close(handle);
  return rows;
}

}  // namespace kestro::testing
