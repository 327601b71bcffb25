#include "ui/apply_boxes.h"

#include <QHBoxLayout>

#include "ui/channel_columns.h"
#include "ui/controls.h"

namespace tendril {
namespace {

QString Tip(std::size_t index) {
  const QString who =
      index < kPortCount ? QStringLiteral("channel %1").arg(index + 1) : QStringLiteral("all channels");
  return QStringLiteral(
             "Gives %1 the pulse values of the channel that is edited, and lets it follow its edits.")
      .arg(who);
}

}  // namespace

ApplyBoxes::ApplyBoxes(ChannelEditor& editor, const std::function<void()>& clicked, QWidget* parent)
    : FrameBox(QStringLiteral("Channels to Apply Changes"), parent), editor_(editor) {
  setObjectName(QStringLiteral("fraApplyChans"));
  QGridLayout* grid = MakeChannelColumns(this);
  for (int index = 0; index <= kAllColumn; ++index) {
    const bool all = index == kAllColumn;
    const QString number = QString::number(index + 1);
    auto* box = Named(new QCheckBox(all ? QStringLiteral("ALL") : QString()),
                      ArrayName(QStringLiteral("chkUpdate"), index));
    box->setAccessibleName(all ? QStringLiteral("Apply changes to all channels")
                               : QStringLiteral("Apply changes to channel %1").arg(number));
    // "clicked" is the person's own; what the program ticks is none.
    QObject::connect(box, &QAbstractButton::clicked, this, [this, index, all, clicked](bool ticked) {
      if (all) {
        editor_.ClickAllBox(ticked);
      } else {
        editor_.ClickApplyBox(static_cast<std::size_t>(index), ticked);
      }
      ShowTicks();
      clicked();
    });
    chkUpdate_[static_cast<std::size_t>(index)] = box;
    if (all) {
      grid->addWidget(box, 0, index);
      continue;
    }
    auto* label = Named(new QLabel(number), ArrayName(QStringLiteral("lblUpdateNum"), index));
    label->setBuddy(box);
    lblUpdateNum_[static_cast<std::size_t>(index)] = label;
    auto* pair = new QHBoxLayout;
    pair->addStretch();
    pair->addWidget(box);
    pair->addWidget(label);
    pair->addStretch();
    grid->addLayout(pair, 0, index);
  }
  ShowEditing(true);
}

void ApplyBoxes::ShowEditing(bool editing) {
  const QString why_not =
      editing ? QString() : QStringLiteral("In the summary each change goes to its own channel alone.");
  for (QLabel* label : lblUpdateNum_) label->setEnabled(editing);
  for (std::size_t index = 0; index < chkUpdate_.size(); ++index) {
    EnableUnless(why_not, chkUpdate_[index], Tip(index));
  }
}

void ApplyBoxes::ShowTicks() {
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    chkUpdate_[channel]->setChecked(editor_.Ticked(channel));
  }
  chkUpdate_.back()->setChecked(editor_.AllTicked());
}

}  // namespace tendril
