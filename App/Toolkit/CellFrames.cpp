// SPDX-License-Identifier: MIT
#include "App/Toolkit/CellFrames.h"

namespace kestro {
namespace {

constexpr qreal kCellMargin = 10;
constexpr qreal kGap = 50;

/// A label of `size` at `left`, in the middle of the height.
QRectF labelFrame(qreal left, const QRectF& bounds, const QSizeF& size) {
  return {QPointF(left, (bounds.height() - size.height()) * 0.5), size};
}

}  // namespace

QRectF keyOnlyFrame(const QRectF& bounds, const QSizeF& key) {
  return labelFrame(bounds.x() + kCellMargin, bounds, key);
}

CellFrames keyValueFrames(const QRectF& bounds, const QSizeF& key, const QSizeF& value) {
  const qreal width = bounds.width();
  const qreal needed = key.width() + kCellMargin + kGap + value.width();
  const qreal afterKey = bounds.x() + kCellMargin + key.width() + kGap;
  const qreal valueLeft = needed < width ? width - value.width() : afterKey;
  const qreal contentWidth = needed <= width ? width : width + key.width() + value.width();
  return {.key = keyOnlyFrame(bounds, key),
          .value = labelFrame(valueLeft, bounds, value),
          .container = {bounds.topLeft(), QSizeF(width, kCellContainerHeight)},
          .contentSize = {contentWidth, kCellContainerHeight}};
}

}  // namespace kestro
