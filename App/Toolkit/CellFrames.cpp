// SPDX-License-Identifier: MIT
#include "App/Toolkit/CellFrames.h"

#include <algorithm>

namespace kestro {
namespace {

constexpr qreal kCellMargin = 10;
constexpr qreal kGap = 50;

/// A label of `size` at `left`, in the middle of the height.
QRectF labelFrame(qreal left, const QRectF& bounds, const QSizeF& size) {
  return {QPointF(left, (bounds.height() - size.height()) * 0.5), size};
}

/// The value below the key, both whole: what is wider than the area even so is scrolled to.
CellFrames framesOfTwoLines(const QRectF& bounds, const QSizeF& key, const QSizeF& value) {
  const qreal width = bounds.width();
  const qreal left = bounds.x() + kCellMargin;
  const qreal top = (bounds.height() - key.height() - value.height()) * 0.5;
  const qreal wider = kCellMargin + std::max(key.width(), value.width());
  return {.key = {QPointF(left, top), key},
          .value = {QPointF(left, top + key.height()), value},
          .container = {bounds.topLeft(), QSizeF(width, kCellContainerHeight)},
          .contentSize = {wider <= width ? width : wider + kCellMargin, kCellContainerHeight}};
}

}  // namespace

QRectF keyOnlyFrame(const QRectF& bounds, const QSizeF& key) {
  return labelFrame(bounds.x() + kCellMargin, bounds, key);
}

CellFrames keyValueFrames(const QRectF& bounds, const QSizeF& key, const QSizeF& value) {
  const qreal width = bounds.width();
  const qreal needed = key.width() + kCellMargin + kGap + value.width();
  const qreal afterKey = bounds.x() + kCellMargin + key.width() + kGap;
  if (needed > width) return framesOfTwoLines(bounds, key, value);
  const qreal valueLeft = needed < width ? width - value.width() : afterKey;
  return {.key = keyOnlyFrame(bounds, key),
          .value = labelFrame(valueLeft, bounds, value),
          .container = {bounds.topLeft(), QSizeF(width, kCellContainerHeight)},
          .contentSize = {width, kCellContainerHeight}};
}

}  // namespace kestro
