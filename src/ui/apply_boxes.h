// ApplyBoxes: the boxes that say which channels an edit changes.
#pragma once

#include <QCheckBox>
#include <QGroupBox>
#include <array>
#include <cstddef>

#include "config/channel_config.h"

namespace tendril {

// The frame `fraApplyChans`: a box for each channel, and "ALL".
class ApplyBoxes : public QGroupBox {
 public:
  explicit ApplyBoxes(QWidget* parent = nullptr);

  // Whether the box of `channel`, 0 to 7, is ticked.
  bool Ticked(std::size_t channel) const { return chkUpdate_[channel]->isChecked(); }
  // Ticks the box of `channel` and clears all others.
  void TickOnly(std::size_t channel);

 private:
  std::array<QCheckBox*, kPortCount + 1> chkUpdate_{};  // the last is "ALL"
};

}  // namespace tendril
