#include "ui/progress_area.h"

#include <QEvent>
#include <QVBoxLayout>

#include "ui/appearance.h"

namespace tendril {
namespace {

constexpr int kBarHeight = 10;

QColor Shade(ProgressColour colour, bool dark) {
  switch (colour) {
    case ProgressColour::kBlue:
      return dark ? QColor(0x64, 0xB5, 0xF6) : QColor(0x15, 0x65, 0xC0);
    case ProgressColour::kGreen:
      return dark ? QColor(0x66, 0xBB, 0x6A) : QColor(0x1B, 0x7A, 0x2B);
    case ProgressColour::kRed:
      return dark ? QColor(0xEF, 0x73, 0x70) : QColor(0xC6, 0x28, 0x28);
  }
  return {};
}

}  // namespace

ProgressArea::ProgressArea()
    // The title keeps room for those of the commands.
    : FrameBox(QStringLiteral("Progress")),
      pctProgress_(Named(new QWidget(this), "pctProgress")),
      ShapeProgress_(Named(new QWidget(pctProgress_), "ShapeProgress")),
      lblProgress_(Named(BoldLabel(), "lblProgress")) {
  setObjectName("frmProgress");
  pctProgress_->setFixedHeight(kBarHeight);
  pctProgress_->setAutoFillBackground(true);
  pctProgress_->setBackgroundRole(QPalette::Base);
  pctProgress_->setAccessibleName(QStringLiteral("Command progress"));
  ShapeProgress_->setAutoFillBackground(true);
  ShapeProgress_->setBackgroundRole(QPalette::Window);  // otherwise inherited from the trough
  lblProgress_->setAlignment(Qt::AlignCenter);

  auto* column = AddLayout<QVBoxLayout>(this, {9, 0, 9, 3}, 2);
  column->addWidget(lblProgress_);
  column->addWidget(pctProgress_);
  ApplyColour();
}

void ProgressArea::ShowRunning(const RunningCommand& running) {
  const std::string& title = running.Active() ? running.What() : running.Stopped();
  if (title.empty()) return;
  setTitle(QString::fromStdString(title));
  Q_EMIT Said(this->title());
}

void ProgressArea::SharePlace(QStackedLayout& place, QWidget* other) {
  place_ = &place;
  place.addWidget(other);
  place.addWidget(this);
}

void ProgressArea::ShowProgress(bool shown) { place_->setCurrentIndex(shown ? 1 : 0); }

void ProgressArea::SetBarWidth(int width) { ShapeProgress_->setGeometry(0, 0, width, kBarHeight); }

void ProgressArea::SetColour(ProgressColour colour) {
  colour_ = colour;
  ApplyColour();
}

void ProgressArea::SetText(const std::string& text) {
  lblProgress_->setText(QString::fromStdString(text));
  if (!text.empty()) Q_EMIT Said(title() + QStringLiteral(": ") + lblProgress_->text());
}

void ProgressArea::changeEvent(QEvent* event) {
  FrameBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange) ApplyColour();
}

void ProgressArea::ApplyColour() {
  const QColor colour = Shade(colour_, IsDark(palette()));
  SetPaletteColour(ShapeProgress_, QPalette::Window, colour);
  SetPaletteColour(lblProgress_, QPalette::WindowText, colour);
}

}  // namespace tendril
