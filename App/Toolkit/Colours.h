// SPDX-License-Identifier: MIT
// The colours of the window, made of the system's light or dark ones.
#pragma once

#include <QColor>
#include <QPalette>

namespace kestro {

struct Colours {
  QColor ground;    ///< behind everything
  QColor row;       ///< of rows and panels
  QColor bar;       ///< of the navigation bar and the toolbar
  QColor hairline;  ///< between rows, and along bars
  QColor text;
  QColor faintText;  ///< for what is less important
  QColor accent;     ///< of what can be pressed; readable on `row` and `bar`
  QColor pressed;    ///< of a row under a finger
  QColor focused;    ///< of the row that keys act on
};

[[nodiscard]] Colours coloursOf(const QPalette& palette);

/// The mixture of both colours in which `second` has the part `share`, from 0 to 1.
[[nodiscard]] QColor mixed(const QColor& first, const QColor& second, qreal share);

/// How well one colour is seen on the other, from 1 to 21.
[[nodiscard]] qreal contrast(const QColor& first, const QColor& second);

/// `colour`, made darker or lighter until small text in it can be read on `background`.
[[nodiscard]] QColor readable(const QColor& colour, const QColor& background);

}  // namespace kestro
