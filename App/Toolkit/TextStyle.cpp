// SPDX-License-Identifier: MIT
#include "App/Toolkit/TextStyle.h"

#include <QApplication>
#include <QFontInfo>
#include <algorithm>
#include <map>
#include <memory>
#include <utility>

namespace kestro {
namespace {

/// The height of the fonts that desktops use unless told otherwise, and the most that rows of one
/// height have room for.
constexpr qreal kUsualPixels = 14;
constexpr qreal kMaximumScale = 2;

constexpr bool isFigure(QChar character) {
  return character.unicode() >= u'0' && character.unicode() <= u'9';
}

/// Calls `figure(position)` for every figure and `run(position, length)` for what lies between.
template <class Figure, class Run>
void walk(const QString& text, Figure figure, Run run) {
  qsizetype start = 0;
  for (qsizetype i = 0; i <= text.size(); ++i) {
    const bool atEnd = i == text.size();
    if (!atEnd && !isFigure(text[i])) continue;
    if (i > start) run(start, i - start);
    if (!atEnd) figure(i);
    start = i + 1;
  }
}

/// The styles of one system font; forgotten when the system's font changes.
struct StyleCache {
  QFont systemFont;
  std::map<std::pair<int, int>, TextStyle> styles;
};
std::unique_ptr<StyleCache> styleCache;

void forgetStyles() { styleCache.reset(); }

StyleCache& currentStyles() {
  const QFont font = QApplication::font();
  if (!styleCache || styleCache->systemFont != font) {
    if (!styleCache) qAddPostRoutine(forgetStyles);
    styleCache = std::make_unique<StyleCache>(StyleCache{font, {}});
  }
  return *styleCache;
}

}  // namespace

TextStyle::TextStyle(const QFont& font) : _font(font), _metrics(font), _figureWidth(0) {
  qreal narrowest = _metrics.horizontalAdvance(u'0');
  for (char16_t figure = u'0'; figure <= u'9'; ++figure) {
    const qreal width = _metrics.horizontalAdvance(figure);
    narrowest = std::min(narrowest, width);
    _figureWidth = std::max(_figureWidth, width);
  }
  _figuresDiffer = narrowest < _figureWidth;
}

QSizeF TextStyle::size(const QString& text) const {
  if (!_figuresDiffer) return {_metrics.horizontalAdvance(text), _metrics.height()};
  qreal width = 0;
  walk(
      text, [&](qsizetype) { width += _figureWidth; },
      [&](qsizetype start, qsizetype length) {
        width += _metrics.horizontalAdvance(text.mid(start, length));
      });
  return {width, _metrics.height()};
}

void TextStyle::draw(QPainter& painter, const QRectF& frame, const QString& text) const {
  painter.setFont(_font);
  QPointF pen(frame.left(), frame.center().y() + (_metrics.ascent() - _metrics.descent()) * 0.5);
  if (!_figuresDiffer) {
    painter.drawText(pen, text);
    return;
  }
  const auto put = [&](const QString& piece, qreal width, qreal indent) {
    painter.drawText(pen + QPointF(indent, 0), piece);
    pen.rx() += width;
  };
  walk(
      text,
      [&](qsizetype i) {
        const qreal slack = _figureWidth - _metrics.horizontalAdvance(text[i]);
        put(text[i], _figureWidth, slack * 0.5);
      },
      [&](qsizetype start, qsizetype length) {
        const QString run = text.mid(start, length);
        put(run, _metrics.horizontalAdvance(run), 0);
      });
}

QString TextStyle::elided(const QString& text, qreal width) const {
  if (size(text).width() <= width) return text;
  return _metrics.elidedText(text, Qt::ElideRight, width);
}

const TextStyle& systemTextStyle(int points, QFont::Weight weight) {
  StyleCache& cache = currentStyles();
  const auto found = cache.styles.find({points, weight});
  if (found != cache.styles.end()) return found->second;
  const TextStyle style(scaledFont(cache.systemFont, points, weight));
  return cache.styles.emplace(std::pair(points, static_cast<int>(weight)), style).first->second;
}

QFont scaledFont(const QFont& family, int points, QFont::Weight weight) {
  QFont font = family;
  const qreal scale = textScale(QFontInfo(QApplication::font()).pixelSize());
  font.setPixelSize(qRound(points * scale));
  font.setWeight(weight);
  return font;
}

qreal textScale(qreal pixels) { return std::clamp(pixels / kUsualPixels, 1.0, kMaximumScale); }

}  // namespace kestro
