// SPDX-License-Identifier: MIT
// SQLite, as far as the store needs it: a file that is written in one transaction.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Platform/Result.h"

struct sqlite3;
struct sqlite3_stmt;

namespace kestro {

class Database;

/// A prepared statement. Parameters are bound in turn, then it runs.
class Statement {
 public:
  Statement(Database& database, std::string_view sql);
  ~Statement();
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  Statement& bind(std::int64_t number);
  Statement& bind(double number);
  /// The text must live until the statement has run.
  Statement& bind(std::string_view text);
  Statement& bindNull();
  template <class T>
  Statement& bind(const std::optional<T>& value) {
    if (!value) return bindNull();
    if constexpr (std::is_floating_point_v<T>) return bind(static_cast<double>(*value));
    return bind(static_cast<std::int64_t>(*value));
  }

  /// Runs it to its end, and makes it ready for the next values. A failure is the database's.
  void run();
  /// Runs it; the first number of the first row, absent without a row.
  [[nodiscard]] std::optional<std::int64_t> number();

 private:
  Database& _database;
  sqlite3_stmt* _statement = nullptr;
  int _next = 1;
};

/// An open file. The first failure counts: what follows it does nothing.
class Database {
 public:
  /// Opens the file, or makes it.
  explicit Database(std::string path);
  ~Database();
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  /// Runs statements without parameters.
  void execute(const char* sql);

  /// Nothing, or what failed first, with the file's name.
  [[nodiscard]] Result<void> state() const;

 private:
  friend class Statement;
  void note(int code);

  std::string _path;
  sqlite3* _handle = nullptr;
  std::optional<Error> _error{};
};

}  // namespace kestro
