// SPDX-License-Identifier: MIT
// The small wheel that turns while something is under way.
#pragma once

#include <QBasicTimer>
#include <QWidget>

namespace kestro {

/// Small and grey. It is stopped at first; while it is stopped it keeps its place but shows
/// nothing.
class ActivityIndicator : public QWidget {
  Q_OBJECT

 public:
  explicit ActivityIndicator(QWidget* parent = nullptr);

  void startAnimating();
  void stopAnimating();
  [[nodiscard]] bool isAnimating() const noexcept { return _isAnimating; }

  [[nodiscard]] QSize sizeHint() const override;

 protected:
  void paintEvent(QPaintEvent* event) override;
  void timerEvent(QTimerEvent* event) override;
  void showEvent(QShowEvent* event) override;
  void hideEvent(QHideEvent* event) override;

 private:
  /// The wheel turns only where it can be seen.
  void updateTimer();

  QBasicTimer _timer;
  int _step = 0;
  bool _isAnimating = false;
};

}  // namespace kestro
