#include "ui/apply_boxes.h"

#include <QHBoxLayout>
#include <QLabel>

#include "ui/channel_columns.h"
#include "ui/controls.h"

namespace tendril {

ApplyBoxes::ApplyBoxes(QWidget* parent) : QGroupBox(QStringLiteral("Channels to Apply Changes"), parent) {
  setObjectName(QStringLiteral("fraApplyChans"));
  QGridLayout* grid = MakeChannelColumns(this);
  for (int index = 0; index <= kAllColumn; ++index) {
    const bool all = index == kAllColumn;
    const QString number = QString::number(index + 1);
    auto* box = Named(new QCheckBox(all ? QStringLiteral("ALL") : QString()),
                      ArrayName(QStringLiteral("chkUpdate"), index));
    box->setAccessibleName(all ? QStringLiteral("Apply changes to all channels")
                               : QStringLiteral("Apply changes to channel %1").arg(number));
    Disable(box, QStringLiteral("Editing channels is not in this version yet."));
    chkUpdate_[static_cast<std::size_t>(index)] = box;
    if (all) {
      grid->addWidget(box, 0, index);
      continue;
    }
    auto* label = Named(new QLabel(number), ArrayName(QStringLiteral("lblUpdateNum"), index));
    label->setBuddy(box);
    label->setEnabled(false);
    auto* pair = new QHBoxLayout;
    pair->addStretch();
    pair->addWidget(box);
    pair->addWidget(label);
    pair->addStretch();
    grid->addLayout(pair, 0, index);
  }
}

void ApplyBoxes::TickOnly(std::size_t channel) {
  for (std::size_t index = 0; index < chkUpdate_.size(); ++index) {
    chkUpdate_[index]->setChecked(index == channel);
  }
}

}  // namespace tendril
