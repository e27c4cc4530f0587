// SPDX-License-Identifier: MIT
#include "Measurements/Database.h"

#include <fmt/format.h>
#include <sqlite3.h>

#include <utility>

namespace kestro {
namespace {

constexpr int kBusyMilliseconds = 2'000;

}  // namespace

Database::Database(std::string path) : _path(std::move(path)) {
  const int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX;
  note(sqlite3_open_v2(_path.c_str(), &_handle, flags, nullptr));
  if (!_error) note(sqlite3_busy_timeout(_handle, kBusyMilliseconds));
}

Database::~Database() { sqlite3_close(_handle); }

void Database::note(int code) {
  if (_error || code == SQLITE_OK || code == SQLITE_DONE || code == SQLITE_ROW) return;
  const char* reason = _handle == nullptr ? sqlite3_errstr(code) : sqlite3_errmsg(_handle);
  _error = Error{fmt::format("{}: {}", _path, reason)};
}

void Database::execute(const char* sql) {
  if (!_error) note(sqlite3_exec(_handle, sql, nullptr, nullptr, nullptr));
}

Result<void> Database::state() const {
  if (_error) return tl::unexpected(*_error);
  return {};
}

Statement::Statement(Database& database, std::string_view sql) : _database(database) {
  if (_database._error) return;
  _database.note(sqlite3_prepare_v3(_database._handle, sql.data(), static_cast<int>(sql.size()),
                                    SQLITE_PREPARE_PERSISTENT, &_statement, nullptr));
}

Statement::~Statement() { sqlite3_finalize(_statement); }

Statement& Statement::bind(std::int64_t number) {
  if (_statement != nullptr) _database.note(sqlite3_bind_int64(_statement, _next++, number));
  return *this;
}

Statement& Statement::bind(double number) {
  if (_statement != nullptr) _database.note(sqlite3_bind_double(_statement, _next++, number));
  return *this;
}

Statement& Statement::bind(std::string_view text) {
  if (_statement == nullptr) return *this;
  const char* characters = text.data() == nullptr ? "" : text.data();
  _database.note(sqlite3_bind_text(_statement, _next++, characters, static_cast<int>(text.size()),
                                   SQLITE_STATIC));
  return *this;
}

Statement& Statement::bindNull() {
  if (_statement != nullptr) _database.note(sqlite3_bind_null(_statement, _next++));
  return *this;
}

void Statement::run() { std::ignore = number(); }

std::optional<std::int64_t> Statement::number() {
  _next = 1;
  if (_statement == nullptr || _database._error) return std::nullopt;
  const int code = sqlite3_step(_statement);
  _database.note(code);
  std::optional<std::int64_t> number;
  if (code == SQLITE_ROW) number = sqlite3_column_int64(_statement, 0);
  sqlite3_reset(_statement);
  return number;
}

}  // namespace kestro
