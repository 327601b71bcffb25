#include "ui/actuals_frame.h"

#include <QFormLayout>

namespace tendril {
namespace {

constexpr std::int32_t kShownMs = 1000;

struct ValueRow {
  const char* caption;
  const char* label;
};
constexpr std::array<ValueRow, 6> kValueRows{{{"Virtual range, low", "lblVirtPulseLeftAct"},
                                              {"Virtual range, high", "lblVirtPulseRightAct"},
                                              {"Neutral", "lblNeutralTrimAct"},
                                              {"Left stop", "lblLeftVirtStopAct"},
                                              {"Right stop", "lblRightVirtStopAct"},
                                              {"Default", "lblDefaultPosAct"}}};

}  // namespace

ActualsFrame::ActualsFrame(TimerFactory& timers, QWidget& window)
    : PopUp("fraActuals", window), tmrShowActuals_(timers.CreateTimer([this] {
        hide();
        tmrShowActuals_->SetEnabled(false);
      })) {
  auto* form = new QFormLayout(this);
  form->addRow(BoldLabel("Physical Values with Trim"));
  for (std::size_t row = 0; row < kValueRows.size(); ++row) {
    values_[row] = Named(new QLabel, kValueRows[row].label);
    values_[row]->setAlignment(Qt::AlignRight);
    form->addRow(QString::fromUtf8(kValueRows[row].caption), values_[row]);
  }
  tmrShowActuals_->SetInterval(kShownMs);
  tmrShowActuals_->SetEnabled(true);
}

void ActualsFrame::ShowActuals(const QWidget& label) {
  OpenBeside(label, 200, 200);
  tmrShowActuals_->SetEnabled(true);
}

void ActualsFrame::SetValues(const ChannelConfig& values) {
  const std::array shown{values.VirtualRange[0], values.VirtualRange[1], values.NeutralPosition,
                         values.VirtualStops[0], values.VirtualStops[1], values.DefaultPosition};
  for (std::size_t row = 0; row < shown.size(); ++row) values_[row]->setNum(shown[row]);
}

}  // namespace tendril
