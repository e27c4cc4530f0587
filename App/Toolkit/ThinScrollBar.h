// SPDX-License-Identifier: MIT
// A slim scroll bar.
#pragma once

#include <QScrollBar>

namespace kestro {

/// Only a slim handle is drawn, on the background of what is scrolled. It works as any scroll bar
/// does.
class ThinScrollBar : public QScrollBar {
  Q_OBJECT

 public:
  explicit ThinScrollBar(QWidget* parent = nullptr);

  /// Sets the colour behind it.
  void setGround(const QColor& ground);

  [[nodiscard]] QSize sizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  QColor _ground;
};

}  // namespace kestro
