#include "ui/actuals_frame.h"

#include <QFormLayout>

#include "ui/controls.h"

namespace tendril {
namespace {

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

ActualsFrame::ActualsFrame(QWidget* parent) : QGroupBox(QStringLiteral("Physical Values with Trim"), parent) {
  setObjectName(QStringLiteral("fraActuals"));
  setAutoFillBackground(true);
  hide();
  auto* form = new QFormLayout(this);
  for (std::size_t row = 0; row < kRows.size(); ++row) {
    values_[row] = Named(BoldLabel({}), QString::fromUtf8(kRows[row].label));
    form->addRow(QString::fromUtf8(kRows[row].caption), values_[row]);
  }
}

}  // namespace tendril
