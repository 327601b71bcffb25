// RecordedProgress: what the progress display shows, for a test to read.
#pragma once

#include <string>

#include "unitops/running_command.h"

namespace tendril::test {

struct RecordedProgress final : public CommandProgressView {
  void ShowProgress(bool now_shown) override { shown = now_shown; }
  int FrameWidth() const override { return frame_width; }
  void SetBarWidth(int width) override { bar_width = width; }
  void SetTitle(const std::string& now_title) override { title = now_title; }
  void SetColour(ProgressColour now_colour) override { colour = now_colour; }
  void SetText(const std::string& now_text) override { text = now_text; }

  bool shown = false;
  int frame_width = 400;
  int bar_width = 0;
  ProgressColour colour = ProgressColour::kBlue;
  std::string title;
  std::string text;
};

}  // namespace tendril::test
