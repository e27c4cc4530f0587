// SPDX-License-Identifier: MIT
// An area that can be touched between the things that stand in it.
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
