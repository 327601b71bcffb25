// ApplyBoxes: the boxes that say which channels an edit changes.
#pragma once

#include <QCheckBox>
#include <QGroupBox>
#include <array>

#include "config/channel_config.h"

namespace tendril {

// The frame `fraApplyChans`: a box for each channel, and "ALL".
class ApplyBoxes : public QGroupBox {
 public:
  explicit ApplyBoxes(QWidget* parent = nullptr);

 private:
  std::array<QCheckBox*, kPortCount + 1> chkUpdate_{};  // the last is "ALL"
};

}  // namespace tendril
