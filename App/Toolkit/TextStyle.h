// SPDX-License-Identifier: MIT
// How this program draws texts in one font: on one line, with all digits equally wide, so that a
// value does not move sideways as it changes.
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

/// The system's font. `points` is its height in pixels at the usual text size; where the system
/// wants larger texts, it is enlarged. The reference is valid until the system's font changes.
[[nodiscard]] const TextStyle& systemTextStyle(int points, QFont::Weight weight = QFont::Normal);

/// Another family's font at that size.
[[nodiscard]] QFont scaledFont(const QFont& family, int points, QFont::Weight weight);

/// How much larger than usual the system wants texts, from 1 to 2. `pixels` is the height of the
/// font that it asks for.
[[nodiscard]] qreal textScale(qreal pixels);

}  // namespace kestro
