// SPDX-License-Identifier: MIT
// The free area of a screen, around and between its other widgets, as a button without a look of
// its own: it tells that the user pressed beside everything else.
#pragma once

#include <QAbstractButton>
#include <QPainter>

#include "App/Toolkit/Colours.h"

namespace kestro {

class BackgroundControl : public QAbstractButton {
  Q_OBJECT

 public:
  explicit BackgroundControl(QWidget* parent = nullptr) : QAbstractButton(parent) {
    setFocusPolicy(Qt::NoFocus);
  }

 protected:
  void paintEvent(QPaintEvent*) override {
    QPainter(this).fillRect(rect(), coloursOf(palette()).ground);
  }
};

}  // namespace kestro
