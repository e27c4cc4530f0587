// SPDX-License-Identifier: MIT
// A message over a window, until its button is pressed.
#pragma once

#include <QWidget>

#include "App/Toolkit/BarButton.h"

namespace kestro {

/// Covers its parent and takes the keys; Enter, Escape and the button close and delete it.
class AlertView : public QWidget {
  Q_OBJECT

 public:
  AlertView(const QString& title, const QString& message, const QString& buttonTitle,
            QWidget* parent);

  [[nodiscard]] const QString& title() const noexcept { return _title; }
  [[nodiscard]] const QString& message() const noexcept { return _message; }
  [[nodiscard]] BarButton& button() const noexcept { return *_button; }

  /// Shows it and gives it the focus. When it closes, the focus goes back to where it was.
  void open();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  bool focusNextPrevChild(bool next) override;
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  [[nodiscard]] QRect panel() const;
  void setCoveredEnabled(bool enabled);
  void dismiss();

  QString _title;
  QString _message;
  BarButton* _button;
};

}  // namespace kestro
