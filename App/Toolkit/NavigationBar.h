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

  /// The title, and that of the screen that the back button leads to; null without a way back.
  void setTitles(const QString& title, const QString& backTitle);
  [[nodiscard]] const QString& title() const noexcept { return _title; }
  [[nodiscard]] BarButton& backButton() const noexcept { return *_back; }

  /// Begins a change to other titles, which are set next: they come in from the right, or from the
  /// left on the way back.
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
