// RunningCommand: which unit command runs, and the progress display that shows it.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "platform/timer.h"
#include "unitops/command_report.h"

namespace tendril {

class UnitOperation;

// Blue while a command runs, green for a success, red for a failure.
enum class ProgressColour { kBlue, kGreen, kRed };
// How a command ended.
enum class Outcome { kSuccess, kFailure };

// What the display is drawn on. Widths are device-independent pixels.
class CommandProgressView {
 public:
  virtual ~CommandProgressView() = default;
  // True: the progress frame replaces "Channels to Apply Changes". False: the reverse.
  virtual void ShowProgress(bool shown) = 0;
  // The inner width of the progress frame, at which the bar is full.
  virtual int FrameWidth() const = 0;
  // Draws the bar `width` wide, which may be a little more than the frame.
  virtual void SetBarWidth(int width) = 0;
  // Sets the frame's title: what runs and how far it is, or where it stopped. It stays until the next one.
  virtual void SetTitle(const std::string& title) = 0;
  // Colours bar and label.
  virtual void SetColour(ProgressColour colour) = 0;
  // Sets the label; empty for none.
  virtual void SetText(const std::string& text) = 0;
};

// At most one command runs. The display shows it, then for three seconds how it ended. The bar is an animation
// that counts nothing and sets no time limit, unless the command says what part of it is done.
class RunningCommand {
 public:
  // `view` must outlive it.
  RunningCommand(TimerFactory& timers, CommandProgressView& view);

  // `observer` is called after each start, each end, and when a command has been cancelled and still runs.
  void SetObserver(std::function<void()> observer) { observer_ = std::move(observer); }
  // `reporter` is called when a command has begun, and when it has ended or could not begin; not when the window closes.
  void SetReporter(std::function<void(const CommandReport&)> reporter) { reporter_ = std::move(reporter); }

  // The command that runs; nullptr when none does.
  UnitOperation* Operation() const { return operation_; }
  // Whether a command runs.
  bool Active() const { return operation_ != nullptr; }
  // What runs, for a tool tip ("Sending to unit 01"); empty when nothing does.
  const std::string& What() const { return what_; }
  // Whether the last command, which may still run, was cancelled.
  bool Cancelled() const { return cancelled_; }

  // `operation` runs from now on: shows the empty bar and lets it grow. `what` as above.
  void StartCommandProgress(UnitOperation& operation, std::string what);
  // Shows how far the command is ("port 3 of 8"). With `part`, 0 to 1, the bar shows that from now on and grows no more
  // by itself.
  void ShowStep(const std::string& step, std::optional<double> part = {});
  // The user has cancelled the command, which runs until its outstanding poll has ended.
  void SetCancelled();
  // Ends the command and shows `text` in green or red for three seconds. `aftermath`: see CommandReport.
  void EndCommandProgress(Outcome outcome, const std::string& text, std::string aftermath);
  // Ends the command, if one runs, and leaves the display as it is.
  void Stop();
  // The same for a command that stops without an outcome of its own, or that could not begin. While it runs, the
  // report's outcome becomes the title ("Stopped: channel 3: 305 to 2695 cannot be sent").
  void StopAt(const CommandReport& report);

 private:
  void OnTick();
  void ShowPart();
  void Report(const CommandReport& report);

  CommandProgressView& view_;
  std::unique_ptr<Timer> tmrProgress_;
  std::function<void()> observer_;
  std::function<void(const CommandReport&)> reporter_;
  UnitOperation* operation_ = nullptr;
  std::string what_;
  bool cancelled_ = false;
  std::int32_t value_ = kEnded;  // the bar's width; kEnded while an outcome is shown, or nothing

  std::optional<double> part_;  // what the bar shows; empty: it grows

  static constexpr std::int32_t kEnded = -1;
};

}  // namespace tendril
