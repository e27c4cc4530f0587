// SPDX-License-Identifier: MIT
#include "App/Toolkit/Colours.h"

#include <algorithm>
#include <cmath>

namespace kestro {
namespace {

/// What small text needs to be read.
constexpr qreal kReadableContrast = 4.5;

qreal linear(qreal component) {
  return component <= 0.04045 ? component / 12.92 : std::pow((component + 0.055) / 1.055, 2.4);
}

qreal luminance(const QColor& colour) {
  return 0.2126 * linear(colour.redF()) + 0.7152 * linear(colour.greenF()) +
         0.0722 * linear(colour.blueF());
}

}  // namespace

QColor mixed(const QColor& first, const QColor& second, qreal share) {
  const auto mix = [share](float a, float b) { return static_cast<float>(a + (b - a) * share); };
  return QColor::fromRgbF(mix(first.redF(), second.redF()), mix(first.greenF(), second.greenF()),
                          mix(first.blueF(), second.blueF()));
}

qreal contrast(const QColor& first, const QColor& second) {
  const auto [darker, lighter] = std::minmax({luminance(first), luminance(second)});
  return (lighter + 0.05) / (darker + 0.05);
}

QColor readable(const QColor& colour, const QColor& background) {
  constexpr int kSteps = 20;
  const bool isDark = luminance(background) < 0.18;
  const QColor end = isDark ? Qt::white : Qt::black;
  QColor result = colour;
  for (int i = 0; i <= kSteps && contrast(result, background) < kReadableContrast; ++i) {
    result = mixed(colour, end, static_cast<qreal>(i) / kSteps);
  }
  return result;
}

Colours coloursOf(const QPalette& palette) {
  const QColor row = palette.color(QPalette::Active, QPalette::Base);
  const QColor text = palette.color(QPalette::Active, QPalette::Text);
  const QColor window = palette.color(QPalette::Active, QPalette::Window);
  const QColor bar = mixed(window, row, 0.5);
  const QColor accent =
      readable(readable(palette.color(QPalette::Active, QPalette::Highlight), row), bar);
  return {.ground = window,
          .row = row,
          .bar = bar,
          .hairline = mixed(row, text, 0.14),
          .text = text,
          .faintText = mixed(row, text, 0.62),
          .accent = accent,
          .pressed = mixed(row, text, 0.1),
          .focused = mixed(row, accent, 0.13)};
}

}  // namespace kestro
