// ApplyBoxes: the boxes that choose which channels an edit changes.
#pragma once

#include <QCheckBox>
#include <QGroupBox>
#include <QLabel>
#include <QString>
#include <array>
#include <cstddef>

#include "config/channel_config.h"
#include "ui/controls.h"
#include "ui/model/channel_editor.h"

namespace tendril {

// The frame `fraApplyChans`: a box for each channel, and "ALL".
class ApplyBoxes : public QGroupBox {
  Q_OBJECT

 public:
  // Clicks go to `editor`, which must outlive the area.
  explicit ApplyBoxes(ChannelEditor& editor);

  // Does what a click on the edited channel's own box does. Does nothing while no channel is edited.
  void Store();
  // Shows which boxes are ticked.
  void ShowTicks();
  // Enables the boxes while no command runs and the summary is not shown. `running_command` is what runs; empty when
  // nothing does.
  void EnableControls(const QString& running_command, bool summary_shown);

 Q_SIGNALS:
  // A click has changed the records of the ticked channels.
  void Applied();

 private:
  void OnClicked(std::size_t index, bool ticked);

  ChannelEditor& editor_;
  std::array<QLabel*, kPortCount> lblUpdateNum_{};
  std::array<QCheckBox*, kPortCount + 1> chkUpdate_{};  // the last is "ALL"
};

}  // namespace tendril
