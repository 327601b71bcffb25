// The columns in which the servos stand above their apply boxes.
#pragma once

#include <QGridLayout>

#include "config/channel_config.h"
#include "ui/controls.h"

namespace tendril {

// After the channels, the column of "ALL".
inline constexpr int kAllColumn = static_cast<int>(kPortCount);

// Gives `frame` one equal column for each channel and a narrow one for "ALL".
inline QGridLayout* MakeChannelColumns(QWidget* frame) {
  constexpr int kAllColumnWidth = 64;
  auto* grid = AddLayout<QGridLayout>(frame, {9, 2, 9, 5});
  grid->setHorizontalSpacing(6);
  for (int channel = 0; channel < kAllColumn; ++channel) grid->setColumnStretch(channel, 1);
  grid->setColumnMinimumWidth(kAllColumn, kAllColumnWidth);
  return grid;
}

}  // namespace tendril
