// CommandProgress: the progress display that the unit commands share.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "platform/timer.h"

namespace tendril {

// Blue while a command runs, green for a success, red for a failure.
enum class ProgressColour { kBlue, kGreen, kRed };
// How a command ended.
enum class Outcome { kSuccess, kFailure };

// What the display is drawn on. Widths are device-independent pixels.
class CommandProgressView {
 public:
  virtual ~CommandProgressView() = default;
  // Shows the progress frame in the place of "Channels to Apply Changes", or that one again.
  virtual void ShowProgress(bool shown) = 0;
  // The inner width of the progress frame, at which the bar is full.
  virtual int FrameWidth() const = 0;
  // Draws the bar `width` wide, which may be a little more than the frame.
  virtual void SetBarWidth(int width) = 0;
  // Colours bar and label.
  virtual void SetColour(ProgressColour colour) = 0;
  // Sets the label; empty for none.
  virtual void SetText(const std::string& text) = 0;
};

// Shows that a command runs, then for three seconds how it ended. The bar is an animation only: it counts
// nothing and sets no time limit.
class CommandProgress {
 public:
  // `view` must outlive the progress.
  CommandProgress(TimerFactory& timers, CommandProgressView& view);

  // Shows the empty bar and lets it grow.
  void StartCommandProgress();
  // Shows `text` in green or red for three seconds.
  void EndCommandProgress(Outcome outcome, const std::string& text);

 private:
  void OnTick();

  CommandProgressView& view_;
  std::unique_ptr<Timer> timer_;
  std::int32_t value_ = kEnded;  // the bar's width; kEnded once the command is over

  static constexpr std::int32_t kEnded = -1;
};

}  // namespace tendril
