// SPDX-License-Identifier: MIT
// The lines above everything else: where the display comes from, what is wrong with that, and what
// has just been done.
#pragma once

#include <QString>
#include <QTimer>
#include <QWidget>
#include <functional>

class QLabel;

namespace kestro {

class BarButton;

class NoticeBar : public QWidget {
  Q_OBJECT

 public:
  /// How long a message stays.
  static constexpr int kMessageMilliseconds = 8000;

  explicit NoticeBar(QWidget* parent = nullptr);

  /// One line, elided where it is too long. Empty: none.
  void setOrigin(const QString& text);
  /// Stays until it is set anew. Empty: none.
  void setNotice(const QString& text);
  /// Stays for a while, with a button when it has a title.
  void showMessage(const QString& text, const QString& buttonTitle = {},
                   std::function<void()> pressed = {});

  [[nodiscard]] QString origin() const { return _originText; }
  [[nodiscard]] QString notice() const;
  [[nodiscard]] QString message() const;
  [[nodiscard]] BarButton& button() const noexcept { return *_button; }

  /// The height that its lines take in this width; 0 when there are none.
  [[nodiscard]] int heightForWidth(int width) const override;
  /// Called when that may have changed.
  void setHeightHandler(std::function<void()> changed) { _heightChanged = std::move(changed); }

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void changeEvent(QEvent* event) override;

 private:
  void placeLines();
  void updateFonts();
  void hideMessage();
  void contentsChanged();

  QString _originText;
  QLabel* _origin;
  QLabel* _notice;
  QLabel* _message;
  BarButton* _button;
  std::function<void()> _pressed;
  std::function<void()> _heightChanged;
  QTimer _messageTimer;
};

}  // namespace kestro
