// SPDX-License-Identifier: MIT
// How long movements on the screen take.
#pragma once

#include <QStyle>
#include <QWidget>

namespace kestro {

/// The length of a slide or fade; 0 where the system wants no animations.
[[nodiscard]] inline int motionMilliseconds(const QWidget& widget) {
  constexpr int kSlide = 260;
  const int wanted =
      widget.style()->styleHint(QStyle::SH_Widget_Animation_Duration, nullptr, &widget);
  return wanted > 0 ? kSlide : 0;
}

}  // namespace kestro
