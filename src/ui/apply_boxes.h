// ApplyBoxes: the boxes that say which channels an edit changes.
#pragma once

#include <QCheckBox>
#include <QLabel>
#include <array>
#include <functional>

#include "config/channel_config.h"
#include "ui/controls.h"
#include "ui/model/channel_editor.h"

namespace tendril {

// The frame `fraApplyChans`: a box for each channel, and "ALL".
class ApplyBoxes : public FrameBox {
 public:
  // Clicks go to `editor`, which must outlive the area; `clicked` is called after each.
  ApplyBoxes(ChannelEditor& editor, const std::function<void()>& clicked, QWidget* parent = nullptr);

  // Shows which boxes are ticked.
  void ShowTicks();
  // Lets the boxes be clicked while the editor is shown.
  void ShowEditing(bool editing);

 private:
  ChannelEditor& editor_;
  std::array<QLabel*, kPortCount> lblUpdateNum_{};
  std::array<QCheckBox*, kPortCount + 1> chkUpdate_{};  // the last is "ALL"
};

}  // namespace tendril
