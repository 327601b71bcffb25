#include "ui/progress_area.h"

#include <QAccessible>
#include <QEvent>
#include <QFrame>
#include <QVBoxLayout>
#include <algorithm>

#include "ui/controls.h"

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

ProgressArea::ProgressArea(QWidget* parent)
    // The title stands until there is more to say, and keeps room for that.
    : FrameBox(QStringLiteral("Progress"), parent),
      pctProgress_(Named(new QWidget(this), QStringLiteral("pctProgress"))),
      ShapeProgress_(Named(new QWidget(pctProgress_), QStringLiteral("ShapeProgress"))),
      lblProgress_(Named(BoldLabel({}), QStringLiteral("lblProgress"))) {
  setObjectName(QStringLiteral("frmProgress"));
  pctProgress_->setFixedHeight(kBarHeight);
  pctProgress_->setAutoFillBackground(true);
  pctProgress_->setBackgroundRole(QPalette::Base);
  pctProgress_->setAccessibleName(QStringLiteral("Command progress"));
  ShapeProgress_->setAutoFillBackground(true);
  ShapeProgress_->setBackgroundRole(QPalette::Window);  // not the trough's, which it would inherit
  lblProgress_->setAlignment(Qt::AlignCenter);

  auto* layout = new QVBoxLayout(this);
  layout->setContentsMargins(9, 0, 9, 3);
  layout->setSpacing(2);
  layout->addWidget(lblProgress_);
  layout->addWidget(pctProgress_);
  ApplyColour();
}

void ProgressArea::ShowRunning(const RunningCommand& running) {
  const std::string& title = running.Active() ? running.What() : running.Stopped();
  if (!title.empty()) setTitle(QString::fromStdString(title));
}

void ProgressArea::SharePlace(QStackedLayout& place, QWidget* other) {
  place_ = &place;
  place.addWidget(other);
  place.addWidget(this);
}

void ProgressArea::ShowProgress(bool shown) { place_->setCurrentIndex(shown ? 1 : 0); }

int ProgressArea::FrameWidth() const { return pctProgress_->width(); }

void ProgressArea::SetBarWidth(int width) { ShapeProgress_->setGeometry(0, 0, width, kBarHeight); }

void ProgressArea::SetColour(ProgressColour colour) {
  colour_ = colour;
  ApplyColour();
}

void ProgressArea::SetText(const std::string& text) {
  lblProgress_->setText(QString::fromStdString(text));
  if (text.empty()) return;
  QAccessibleEvent alert(lblProgress_, QAccessible::Alert);  // read out by itself
  QAccessible::updateAccessibility(&alert);
}

void ProgressArea::changeEvent(QEvent* event) {
  FrameBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange) ApplyColour();
}

void ProgressArea::ApplyColour() {
  const QColor colour = Shade(colour_, IsDark(*this));
  QPalette bar = ShapeProgress_->palette();
  bar.setColor(QPalette::Window, colour);
  ShapeProgress_->setPalette(bar);
  QPalette label = lblProgress_->palette();
  label.setColor(QPalette::WindowText, colour);
  lblProgress_->setPalette(label);
}

}  // namespace tendril
