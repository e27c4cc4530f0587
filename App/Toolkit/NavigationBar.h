// SPDX-License-Identifier: MIT
// The bar at the top: the title of the screen, and the way back.
#pragma once

#include <QString>
#include <QWidget>

#include "App/Toolkit/BarButton.h"

namespace kestro {

class NavigationBar : public QWidget {
  Q_OBJECT

 public:
  static constexpr int kHeight = 52;

  explicit NavigationBar(QWidget* parent = nullptr);

  /// Sets the title of this screen, and that of the screen that the back button leads to. A null
  /// `backTitle` means that there is no way back.
  void setTitles(const QString& title, const QString& backTitle);
  [[nodiscard]] const QString& title() const noexcept { return _title; }
  [[nodiscard]] BarButton& backButton() const noexcept { return *_back; }

  /// Begins a change of titles. The new titles are set next; they come in from the right, or, on
  /// the way back, from the left.
  void beginTransition(bool isForward);
  /// How far the change is, from 0 to 1; at 1 it is over.
  void setTransition(qreal progress);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  void placeBackButton();
  void paintTitle(QPainter& painter, const QString& title, qreal shift, qreal opacity) const;

  QString _title;
  QString _earlierTitle;
  BarButton* _back;
  qreal _progress = 1;
  int _direction = 1;
};

}  // namespace kestro
