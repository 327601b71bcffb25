#include "ui/apply_boxes.h"

#include <QHBoxLayout>

#include "ui/channel_columns.h"

namespace tendril {

ApplyBoxes::ApplyBoxes(ChannelEditor& editor)
    : QGroupBox(QStringLiteral("Channels to Apply Changes")), editor_(editor) {
  setObjectName("fraApplyChans");
  QGridLayout* grid = MakeChannelColumns(this);
  for (std::size_t i = 0; i < chkUpdate_.size(); ++i) {
    const bool all = i == kPortCount;
    const QString number = QString::number(i + 1);
    const QString who = all ? QStringLiteral("all channels") : QStringLiteral("channel %1").arg(number);
    auto* box = chkUpdate_[i] = Named(new QCheckBox, "chkUpdate", i);
    box->setAccessibleName(QStringLiteral("Apply changes to %1").arg(who));
    Describe(box,
             QStringLiteral(
                 "Gives %1 the pulse values of the channel that is edited, and lets it follow its edits.")
                 .arg(who));
    // Only the user's clicks emit "clicked"; ticks that the program sets do not.
    connect(box, &QAbstractButton::clicked, this, [this, i](bool ticked) { OnClicked(i, ticked); });
    if (all) {
      box->setText(QStringLiteral("ALL"));
      grid->addWidget(box, 0, kAllColumn);
      continue;
    }
    auto* label = lblUpdateNum_[i] = Named(new QLabel(number), "lblUpdateNum", i);
    label->setBuddy(box);
    auto* pair = new QHBoxLayout;
    pair->addStretch();
    pair->addWidget(box);
    pair->addWidget(label);
    pair->addStretch();
    grid->addLayout(pair, 0, static_cast<int>(i));
  }
}

void ApplyBoxes::OnClicked(std::size_t index, bool ticked) {
  if (index == kPortCount) {
    editor_.ClickAllBox(ticked);
  } else {
    editor_.ClickApplyBox(index, ticked);
  }
  ShowTicks();
  Q_EMIT Applied();
}

void ApplyBoxes::EnableControls(const QString& running_command, bool summary_shown) {
  const QString why_not = running_command.isEmpty() && summary_shown
                              ? QStringLiteral("In the summary each change goes to its own channel alone.")
                              : running_command;
  for (QLabel* label : lblUpdateNum_) label->setEnabled(why_not.isEmpty());
  for (QCheckBox* box : chkUpdate_) EnableUnless(why_not, box);
}

void ApplyBoxes::Store() {
  if (const auto channel = editor_.Channel()) OnClicked(*channel, true);
}

void ApplyBoxes::ShowTicks() {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    chkUpdate_[channel]->setChecked(editor_.Ticked(channel));
  }
  chkUpdate_.back()->setChecked(editor_.AllTicked());
}

}  // namespace tendril
