#include "ui/progress_area.h"

#include <QEvent>
#include <QHBoxLayout>
#include <QVBoxLayout>

#include "ui/appearance.h"

namespace tendril {
namespace {

constexpr int kBarHeight = 10;

constexpr float kTint = 0.3F;  // of the field behind the outcome

struct Look {
  QColor colour;
  SignKind sign;
};

Look LookOf(ProgressColour colour) {
  switch (colour) {
    case ProgressColour::kBlue:
      return {QColor(0x1E, 0x7F, 0xDB), SignKind::kRunning};
    case ProgressColour::kGreen:
      return {QColor(0x2A, 0x94, 0x3E), SignKind::kSuccess};
    case ProgressColour::kRed:
      return {QColor(0xDB, 0x3A, 0x3A), SignKind::kFailure};
  }
  return {};
}

QColor Tinted(const QColor& ground, QColor tint) {
  tint.setAlphaF(kTint);
  return OnBackground(tint, ground);
}

}  // namespace

ProgressArea::ProgressArea()
    // The title keeps room for those of the commands.
    : QGroupBox(QStringLiteral("Progress")),
      pctProgress_(Named(new QWidget(this), "pctProgress")),
      ShapeProgress_(Named(new QWidget(pctProgress_), "ShapeProgress")),
      field_(new QWidget),
      sign_(new Sign(SignKind::kRunning)),
      lblProgress_(Named(BoldLabel(), "lblProgress")),
      cmdCancel_(Named(new QPushButton(QStringLiteral("Cancel")), "cmdCancel")) {
  setObjectName("frmProgress");
  pctProgress_->setFixedHeight(kBarHeight);
  pctProgress_->setAutoFillBackground(true);
  pctProgress_->setBackgroundRole(QPalette::Base);
  pctProgress_->setAccessibleName(QStringLiteral("Command progress"));
  ShapeProgress_->setAutoFillBackground(true);
  ShapeProgress_->setBackgroundRole(QPalette::Window);  // otherwise inherited from the trough
  field_->setAutoFillBackground(true);
  auto* outcome = AddLayout<QHBoxLayout>(field_, {4, 0, 4, 0});
  outcome->addWidget(sign_);
  outcome->addWidget(lblProgress_, 1);

  Describe(
      cmdCancel_,
      "Ends the command after the unit's next reply. The status bar says how the unit is left. (Escape)");
  connect(cmdCancel_, &QAbstractButton::clicked, this, &ProgressArea::CancelPressed);

  auto* row = AddLayout<QHBoxLayout>(this, {9, 0, 9, 3});
  auto* column = new QVBoxLayout;
  column->setSpacing(2);
  column->addWidget(field_);
  column->addWidget(pctProgress_);
  row->addLayout(column, 1);
  row->addWidget(cmdCancel_);
  ApplyColour();
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

void ProgressArea::EnableCancel(const QString& why_not) {
  if (!why_not.isEmpty()) MoveFocusToWindow(*cmdCancel_);
  EnableUnless(why_not, cmdCancel_);
}

void ProgressArea::changeEvent(QEvent* event) {
  QGroupBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange) ApplyColour();
}

// The outcome stands in the text's colour on a field in the outcome's colour.
void ProgressArea::ApplyColour() {
  const auto [colour, sign] = LookOf(colour_);
  const QColor window = palette().color(QPalette::Window);
  const QColor field = colour_ == ProgressColour::kBlue ? window : Tinted(window, colour);
  QPalette colours = palette();
  colours.setColor(QPalette::Window, field);
  colours.setColor(QPalette::WindowText,
                   WithContrast(colours.color(QPalette::WindowText), field, kTextContrast));
  field_->setPalette(colours);
  sign_->SetKind(sign);
  SetPaletteColour(ShapeProgress_, QPalette::Window,
                   WithContrast(colour, palette().color(QPalette::Base), kEdgeContrast));
}

}  // namespace tendril
