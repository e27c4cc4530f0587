// SPDX-License-Identifier: MIT
// One font as this program sets texts in it: on one line, with figures of equal width, so that
// values do not jitter as they change.
#pragma once

#include <QFont>
#include <QFontMetricsF>
#include <QPainter>
#include <QRectF>
#include <QSizeF>
#include <QString>

namespace kestro {

/// Needs a QGuiApplication. Sizes are device-independent pixels.
class TextStyle {
 public:
  explicit TextStyle(const QFont& font);

  [[nodiscard]] const QFont& font() const noexcept { return _font; }
  /// The size of `text` as `draw` sets it.
  [[nodiscard]] QSizeF size(const QString& text) const;
  /// Sets `text` at the left of `frame`, in the middle of its height, with the painter's pen. What
  /// is longer than the frame runs over its right edge.
  void draw(QPainter& painter, const QRectF& frame, const QString& text) const;
  /// `text`, or as much of it as fits into `width` with "…" in place of the rest.
  [[nodiscard]] QString elided(const QString& text, qreal width) const;

 private:
  QFont _font;
  QFontMetricsF _metrics;
  qreal _figureWidth;
  bool _figuresDiffer;  ///< whether the font's own figures differ in width
};

/// The system's font at a size of so many points of a screen at its usual text size; the system's
/// text scaling enlarges it. The reference is valid until the system's font changes.
[[nodiscard]] const TextStyle& systemTextStyle(int points, QFont::Weight weight = QFont::Normal);

/// Another family's font at that size.
[[nodiscard]] QFont scaledFont(const QFont& family, int points, QFont::Weight weight);

/// How much larger than usual the system wants texts, from 1 to 2, for a font of `pixels` height
/// that it asks for.
[[nodiscard]] qreal textScale(qreal pixels);

}  // namespace kestro
