// SPDX-License-Identifier: MIT
#include "App/Panes/KestroCell.h"

#include <QLinearGradient>
#include <QPainter>
#include <algorithm>
#include <utility>

#include "App/Toolkit/Colours.h"

namespace kestro {
namespace {

constexpr int kValuePoints = 15;
constexpr QMarginsF kMarkMargins(7, 3, 7, 3);
constexpr qreal kEdgeWidth = 24;
/// How much of the text's colour a value has, and one that is not renewed.
constexpr qreal kValueShare = 0.82;
constexpr qreal kKeptValueShare = 0.5;

/// What both texts are measured in, whatever they are drawn in.
const TextStyle& measuringStyle() { return systemTextStyle(kValuePoints, QFont::Bold); }

}  // namespace

const TextStyle& TextLabel::style() const { return systemTextStyle(kValuePoints, weight); }

KestroCell::KestroCell(Style style, QString reuseIdentifier)
    : TableCell(std::move(reuseIdentifier)), _key{{}, QFont::Bold, {}} {
  if (style == Style::KeyValue) _value = TextLabel{{}, QFont::Normal, {}};
}

void KestroCell::setKey(const QString& text) {
  _key.text = text;
  updateAccessibleName();
}

void KestroCell::setValue(const QString& text) {
  if (!_value) return;
  _value->text = text;
  updateAccessibleName();
}

void KestroCell::setRenewed(bool isRenewed) {
  if (std::exchange(_isRenewed, isRenewed) != isRenewed) update();
}

void KestroCell::updateAccessibleName() {
  setAccessibleName(_key.text);
  setAccessibleDescription(value());
  update();
}

void KestroCell::setLayoutKey() {
  _layout = Layout::Key;
  layoutKeyAlone();
}

void KestroCell::setLayout() {
  _layout = Layout::KeyValue;
  layoutKeyAndValue();
}

void KestroCell::layoutContent() {
  if (_layout == Layout::Key) {
    layoutKeyAlone();
  } else {
    layoutKeyAndValue();
  }
}

void KestroCell::layoutKeyAlone() {
  _key.frame = keyOnlyFrame(contentBounds(), measuringStyle().size(_key.text));
  if (_value) _value->frame = {};
  _contentSize = _containerFrame.size();
  _offset = 0;
  update();
}

void KestroCell::layoutKeyAndValue() {
  const CellFrames frames = keyValueFrames(contentBounds(), measuringStyle().size(_key.text),
                                           measuringStyle().size(value()));
  _key.frame = frames.key;
  if (_value) {
    _value->frame = frames.value;
    _containerFrame = frames.container;
    _contentSize = frames.contentSize;
  }
  _offset = std::clamp(_offset, 0.0, maximumOffset());
  update();
}

qreal KestroCell::maximumOffset() const {
  return std::max(0.0, _contentSize.width() - _containerFrame.width());
}

bool KestroCell::scrollContentBy(qreal distance) {
  const qreal offset = std::clamp(_offset + distance, 0.0, maximumOffset());
  if (offset == _offset) return false;
  _offset = offset;
  update();
  return true;
}

QString KestroCell::hiddenText() const {
  if (_layout == Layout::Key) {
    const qreal room = contentBounds().width() - _key.frame.left();
    return _key.frame.width() > room ? _key.text : QString();
  }
  return maximumOffset() > 0 ? _key.text + u'\n' + value() : QString();
}

QRectF KestroCell::markedArea() const {
  if (!_value) return contentBounds();
  QRectF drawn = _value->frame.translated(-_offset, 0);
  drawn.setWidth(_value->style().size(_value->text).width());
  return drawn.marginsAdded(kMarkMargins);
}

void KestroCell::paintContent(QPainter& painter) {
  const TextStyle& keyStyle = _key.style();
  if (_layout == Layout::Key) {  // nothing scrolls: what does not fit is cut
    const qreal room = contentBounds().width() - _key.frame.left();
    keyStyle.draw(painter, _key.frame, keyStyle.elided(_key.text, room));
    return;
  }
  painter.translate(-_offset, 0);
  keyStyle.draw(painter, _key.frame, _key.text);
  if (_value) {
    painter.setPen(mixed(coloursOf(palette()).row, coloursOf(palette()).text,
                         _isRenewed ? kValueShare : kKeptValueShare));
    _value->style().draw(painter, _value->frame, _value->text);
  }
  painter.translate(_offset, 0);
  paintEdges(painter);
}

void KestroCell::paintEdges(QPainter& painter) const {
  const QColor row = coloursOf(palette()).row;
  QColor clear = row;
  clear.setAlpha(0);
  const auto fade = [&](qreal solid, qreal open) {
    QLinearGradient gradient(solid, 0, open, 0);
    gradient.setColorAt(0, row);
    gradient.setColorAt(1, clear);
    painter.fillRect(QRectF(std::min(solid, open), 0, kEdgeWidth, height()), gradient);
  };
  const qreal right = _containerFrame.right();
  const qreal textEnd = _value ? _value->frame.right() : _key.frame.right();
  if (_offset > 0) fade(0, kEdgeWidth);
  if (textEnd - _offset > right) fade(right, right - kEdgeWidth);
}

}  // namespace kestro
