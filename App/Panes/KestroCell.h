// SPDX-License-Identifier: MIT
// The row of a pane: a name, or a name and its value.
#pragma once

#include <optional>

#include "App/Toolkit/CellFrames.h"
#include "App/Toolkit/TableCell.h"
#include "App/Toolkit/TextStyle.h"

namespace kestro {

/// A text at a place.
struct TextLabel {
  QString text;
  QFont::Weight weight;
  QRectF frame;

  [[nodiscard]] const TextStyle& style() const;
};

/// A cell is made with a value or without; it stays so. `key` and `value` only change what it
/// shows; `setLayoutKey` or `setLayout` then places it, and again whenever its area changes.
class KestroCell : public TableCell {
  Q_OBJECT

 public:
  enum class Style { Key, KeyValue };
  KestroCell(Style style, QString reuseIdentifier);

  [[nodiscard]] QString key() const { return _key.text; }
  void setKey(const QString& text);
  /// Empty in a key-only cell.
  [[nodiscard]] QString value() const { return _value ? _value->text : QString(); }
  /// Does nothing in a key-only cell.
  void setValue(const QString& text);

  /// A value that is not renewed is drawn faint.
  void setRenewed(bool isRenewed);
  [[nodiscard]] bool isRenewed() const noexcept { return _isRenewed; }

  /// Places the key alone.
  void setLayoutKey();
  /// Places key and value in their container.
  void setLayout();

  [[nodiscard]] const TextLabel& keyLabel() const noexcept { return _key; }
  /// Absent in key-only cells, as is the container.
  [[nodiscard]] const std::optional<TextLabel>& valueLabel() const noexcept { return _value; }
  [[nodiscard]] const QRectF& containerFrame() const noexcept { return _containerFrame; }
  [[nodiscard]] const QSizeF& containerContentSize() const noexcept { return _contentSize; }
  /// How far the container is scrolled to the right.
  [[nodiscard]] qreal containerOffset() const noexcept { return _offset; }

  bool scrollContentBy(qreal distance) override;
  [[nodiscard]] QString hiddenText() const override;

 protected:
  void paintContent(QPainter& painter) override;
  void layoutContent() override;
  /// As wide as the value is drawn, not as it is measured.
  [[nodiscard]] QRectF markedArea() const override;

 private:
  enum class Layout { Key, KeyValue };

  void layoutKeyAlone();
  void layoutKeyAndValue();
  [[nodiscard]] qreal maximumOffset() const;
  /// Shows that there is more beyond the edges of the container.
  void paintEdges(QPainter& painter) const;
  void updateAccessibleName();

  TextLabel _key;
  std::optional<TextLabel> _value;
  QRectF _containerFrame;
  QSizeF _contentSize;
  qreal _offset = 0;
  Layout _layout = Layout::Key;
  bool _isRenewed = true;
};

}  // namespace kestro
