// SPDX-License-Identifier: MIT
// Where the labels of a cell stand. Device-independent pixels throughout.
#pragma once

#include <QRectF>
#include <QSizeF>

namespace kestro {

/// The height of the container that a key/value cell's labels lie in.
inline constexpr qreal kCellContainerHeight = 50;

/// Where the parts of a key/value cell stand; the labels' frames are in the container's content.
struct CellFrames {
  QRectF key;
  QRectF value;
  QRectF container;
  QSizeF contentSize;  ///< of the container; wider than its frame where it can be scrolled
};

/// The frame of a key-only cell's label in the content area's `bounds`; `key` is its text's size.
[[nodiscard]] QRectF keyOnlyFrame(const QRectF& bounds, const QSizeF& key);

/// The frames of a key/value cell in the content area's `bounds`; `key` and `value` are the sizes
/// of their texts. The value is flush with the right edge where both fit with a gap between them,
/// else it stands below the key; the container scrolls where one of them is wider than the area.
[[nodiscard]] CellFrames keyValueFrames(const QRectF& bounds, const QSizeF& key,
                                        const QSizeF& value);

}  // namespace kestro
