// SPDX-License-Identifier: MIT
#include "App/Panes/KestroSaveViewController.h"

#include <QGuiApplication>
#include <QInputMethod>
#include <QKeyEvent>
#include <QPainter>
#include <algorithm>
#include <utility>

#include "App/Toolkit/Colours.h"
#include "App/Toolkit/Column.h"
#include "App/Toolkit/TextStyle.h"
#include "Platform/DeviceRoot.h"
#include "Platform/MainQueue.h"
#include "ui_KestroSaveViewController.h"

namespace kestro {
namespace {

constexpr int kCellPoints = 13;
constexpr int kSaveTitlePoints = 17;
constexpr int kCaptionPoints = 13;
constexpr int kFieldPoints = 15;
constexpr int kFieldMargin = 6;
constexpr qreal kTextIndent = 10;
constexpr int kSaveMargin = 16;

QString saveIdentifier() { return QStringLiteral("SaveHistoryContentCell"); }

/// A line of text.
class SaveHistoryContentCell : public TableCell {
 public:
  SaveHistoryContentCell() : TableCell(saveIdentifier()) {}

  /// The font follows the system's text size, as tables fill their cells anew when it changes.
  void setText(const QString& text) {
    setFont(scaledFont(QFont(QStringLiteral("Helvetica")), kCellPoints, QFont::Normal));
    _text = text;
    setAccessibleName(text);
    update();
  }

 protected:
  void paintContent(QPainter& painter) override {
    const TextStyle style(font());
    const QRectF frame = contentBounds().adjusted(kTextIndent, 0, 0, 0);
    style.draw(painter, frame, style.elided(_text, frame.width()));
  }

 private:
  QString _text;
};

void setTextColour(QWidget& widget, const QColor& colour) {
  QPalette palette = widget.palette();
  palette.setColor(QPalette::WindowText, colour);
  widget.setPalette(palette);
}

}  // namespace

KestroSaveViewController::KestroSaveViewController(Platform& platform, const Value& saveContents,
                                                   Handlers handlers)
    : _platform(platform),
      _handlers(std::move(handlers)),
      _snapshot(platform.clock(), saveContents),
      _ui(std::make_unique<Ui::KestroSaveViewController>()) {
  _ui->setupUi(this);
  viewDidLoad();
}

KestroSaveViewController::~KestroSaveViewController() = default;

QLineEdit& KestroSaveViewController::saveDescription() const { return *_ui->saveDescription; }
TableView& KestroSaveViewController::saveContentTable() const { return *_ui->saveContentTable; }

void KestroSaveViewController::viewDidLoad() {
  connectControls();
  const Colours colours = coloursOf(palette());
  _ui->titleLabel->setFont(systemTextStyle(kSaveTitlePoints, QFont::Bold).font());
  _ui->saveDescription->setFont(systemTextStyle(kFieldPoints).font());
  _ui->saveDescription->setTextMargins(kFieldMargin, 0, kFieldMargin, 0);
  for (QLabel* caption : {_ui->descriptionCaption, _ui->contentCaption}) {
    caption->setFont(systemTextStyle(kCaptionPoints).font());
    setTextColour(*caption, colours.faintText);
  }
  _ui->saveButton->setStrong(true);
  setFocusProxy(_ui->saveDescription);
  _ui->saveContentTable->setDataSource(
      {.numberOfRows = [this] { return static_cast<int>(_snapshot.entries().size()); },
       .cellForRow = [this](int row) { return cellForRow(row); },
       .rowSelected =
           [this](int) {
             _ui->saveContentTable->deselectRow();
             hideKeyboard();
           },
       .textOfRow = {}});
  _ui->saveContentTable->reloadData();
  _ui->saveContentTable->setMaximumHeight(_ui->saveContentTable->contentHeight());
}

void KestroSaveViewController::connectControls() {
  connect(_ui->saveButton, &BarButton::clicked, this, [this] { savePressed(); });
  connect(_ui->cancelButton, &BarButton::clicked, this, [this] { cancelPressed(); });
  connect(_ui->background, &BackgroundControl::clicked, this, [this] { backgroundTouched(); });
  connect(_ui->saveDescription, &QLineEdit::returnPressed, this,
          [this] { textFieldShouldReturn(); });
}

std::unique_ptr<TableCell> KestroSaveViewController::cellForRow(int row) {
  auto reused = _ui->saveContentTable->dequeueReusableCell(saveIdentifier(), row);
  std::unique_ptr<SaveHistoryContentCell> cell(
      static_cast<SaveHistoryContentCell*>(reused.release()));
  if (!cell) cell = std::make_unique<SaveHistoryContentCell>();
  const Value entry = _snapshot.entries()[static_cast<std::size_t>(row)];
  cell->setText(QString::fromStdString(entryDescription(entry)));
  cell->setAccessory(CellAccessory::Checkmark);
  return cell;
}

void KestroSaveViewController::savePressed() {
  const auto path = _snapshot.save(_platform, _ui->saveDescription->text().toStdString());
  if (!path && _handlers.writeFailed) _handlers.writeFailed();
  if (path && _handlers.saved) _handlers.saved(_platform.deviceRoot().hostPath(*path));
  postClose();
}

void KestroSaveViewController::cancelPressed() { postClose(); }

void KestroSaveViewController::postClose() { _platform.mainQueue().post(_handlers.close); }

bool KestroSaveViewController::textFieldShouldReturn() {
  hideKeyboard();
  return true;
}

void KestroSaveViewController::backgroundTouched() { hideKeyboard(); }

void KestroSaveViewController::hideKeyboard() {
  if (!_ui->saveDescription->hasFocus()) return;
  QGuiApplication::inputMethod()->hide();
  // Keys go on working: the table has them now.
  _ui->saveContentTable->setFocus(Qt::OtherFocusReason);
}

void KestroSaveViewController::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Escape || event->key() == Qt::Key_Back) {
    cancelPressed();
  } else if (event->matches(QKeySequence::Save)) {
    savePressed();
  }
  event->accept();
}

void KestroSaveViewController::resizeEvent(QResizeEvent*) {
  const int left = columnIn(width()).left;
  _ui->barLayout->setContentsMargins(left + kSaveMargin / 2, 0, left + kSaveMargin / 2, 1);
  _ui->formLayout->setContentsMargins(left + kSaveMargin, kSaveMargin, left + kSaveMargin,
                                      kSaveMargin);
}

void KestroSaveViewController::paintEvent(QPaintEvent*) {
  const Colours colours = coloursOf(palette());
  const int barHeight = _ui->bar->height();
  QPainter painter(this);
  painter.fillRect(rect(), colours.bar);
  painter.fillRect(QRect(0, barHeight - 1, width(), 1), colours.hairline);
}

}  // namespace kestro
