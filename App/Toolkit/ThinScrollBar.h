// SPDX-License-Identifier: MIT
// A scroll bar that does not draw the eye.
#pragma once

#include <QScrollBar>

namespace kestro {

/// A slim handle on the colour of what is scrolled; it works as any scroll bar does.
class ThinScrollBar : public QScrollBar {
  Q_OBJECT

 public:
  explicit ThinScrollBar(QWidget* parent = nullptr);

  /// What it stands on.
  void setGround(const QColor& ground);

  [[nodiscard]] QSize sizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  QColor _ground;
};

}  // namespace kestro
