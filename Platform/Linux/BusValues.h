// SPDX-License-Identifier: MIT
// The bus's values in Qt's form and in ours.
#pragma once

#include <QList>
#include <QVariant>
#include <optional>
#include <vector>

#include "Platform/BusValue.h"

namespace kestro {

/// What a message's arguments hold; absent when they are more than `limit` values, those inside of
/// others counted.
[[nodiscard]] std::optional<std::vector<BusValue>> busValues(const QList<QVariant>& arguments,
                                                             std::size_t limit);

/// A value of the types b, i, u, t, d, s or o in Qt's form; an invalid one for any other.
[[nodiscard]] QVariant qtValue(const BusValue& value);

}  // namespace kestro
