// The columns in which the servos and their apply boxes stand above each other.
#pragma once

#include <QGridLayout>
#include <QWidget>

#include "config/channel_config.h"

namespace tendril {

inline constexpr int kChannelColumns = static_cast<int>(kPortCount);
// After the channels, the column of "ALL".
inline constexpr int kAllColumn = kChannelColumns;

// Lays `frame` out in one equal column for each channel and a narrow one for "ALL".
inline QGridLayout* MakeChannelColumns(QWidget* frame) {
  constexpr int kAllColumnWidth = 64;
  auto* grid = new QGridLayout(frame);
  grid->setContentsMargins(9, 2, 9, 5);
  grid->setHorizontalSpacing(6);
  for (int channel = 0; channel < kChannelColumns; ++channel) grid->setColumnStretch(channel, 1);
  grid->setColumnMinimumWidth(kAllColumn, kAllColumnWidth);
  return grid;
}

}  // namespace tendril
