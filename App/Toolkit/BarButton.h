// SPDX-License-Identifier: MIT
// A button of a bar: a text in the accent colour, without a frame.
#pragma once

#include <QAbstractButton>

namespace kestro {

class BarButton : public QAbstractButton {
  Q_OBJECT

 public:
  enum class Shape { Plain, Back, Filled };

  explicit BarButton(QWidget* parent = nullptr);

  /// Back has an arrow before its text; Filled has a frame in the accent colour.
  void setShape(Shape shape);
  /// A strong button is for what the user most likely wants next.
  void setStrong(bool strong);

  [[nodiscard]] QSize sizeHint() const override;
  [[nodiscard]] QSize minimumSizeHint() const override { return sizeHint(); }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void enterEvent(QEnterEvent* event) override;
  void leaveEvent(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  [[nodiscard]] qreal textIndent() const;
  void paintFrame(QPainter& painter, QColor fill) const;
  void paintContent(QPainter& painter) const;

  Shape _shape = Shape::Plain;
  bool _isStrong = false;
};

}  // namespace kestro
