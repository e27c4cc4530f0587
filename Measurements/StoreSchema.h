// SPDX-License-Identifier: MIT
// The tables, indexes and views of a store; Documentation/measurements.md describes them.
#pragma once

namespace kestro {

/// "KEST": tells a store from other SQLite files.
inline constexpr int kStoreApplication = 0x4B455354;
/// Grows when the tables change.
inline constexpr int kStoreVersion = 1;

extern const char* const kStoreTables;
extern const char* const kStoreViews;
extern const char* const kDropStoreIndexes;
extern const char* const kMakeStoreIndexes;

}  // namespace kestro
