#include "ui/actuals_frame.h"

#include <QFormLayout>

#include "ui/controls.h"

namespace tendril {
namespace {

constexpr std::int32_t kShownMs = 1000;
// 200 form units to the right and below the label's corner.
constexpr QPoint kBesideLabel(200 / kFormUnitsPerPixel, 200 / kFormUnitsPerPixel);

struct Row {
  const char* caption;
  const char* label;
};
constexpr std::array<Row, 6> kRows{{{"Virtual range, low", "lblVirtPulseLeftAct"},
                                    {"Virtual range, high", "lblVirtPulseRightAct"},
                                    {"Neutral", "lblNeutralTrimAct"},
                                    {"Left stop", "lblLeftVirtStopAct"},
                                    {"Right stop", "lblRightVirtStopAct"},
                                    {"Default", "lblDefaultPosAct"}}};

}  // namespace

ActualsFrame::ActualsFrame(TimerFactory& timers, QWidget& window)
    : QFrame(&window), tmrShowActuals_(timers.CreateTimer([this] {
        hide();
        tmrShowActuals_->SetEnabled(false);
      })) {
  setObjectName(QStringLiteral("fraActuals"));
  setFrameStyle(QFrame::Box | QFrame::Plain);
  setAutoFillBackground(true);
  hide();
  auto* form = new QFormLayout(this);
  form->addRow(BoldLabel(QStringLiteral("Physical Values with Trim")));
  for (std::size_t row = 0; row < kRows.size(); ++row) {
    values_[row] = Named(new QLabel, QString::fromUtf8(kRows[row].label));
    values_[row]->setAlignment(Qt::AlignRight);
    form->addRow(QString::fromUtf8(kRows[row].caption), values_[row]);
  }
  tmrShowActuals_->SetInterval(kShownMs);
  tmrShowActuals_->SetEnabled(true);
}

void ActualsFrame::ShowActuals(const QWidget& label) {
  adjustSize();
  move(WithinParent(*this, label.mapTo(parentWidget(), QPoint()) + kBesideLabel));
  raise();
  show();
  tmrShowActuals_->SetEnabled(true);
}

void ActualsFrame::SetValues(const ChannelConfig& values) {
  const std::array shown{values.VirtualRange[0], values.VirtualRange[1], values.NeutralPosition,
                         values.VirtualStops[0], values.VirtualStops[1], values.DefaultPosition};
  for (std::size_t row = 0; row < shown.size(); ++row) values_[row]->setNum(shown[row]);
}

}  // namespace tendril
