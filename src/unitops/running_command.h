// RunningCommand: which unit command runs, and the progress display that shows it.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <utility>

#include "platform/timer.h"

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
  // Sets the frame's title: what runs, or where it stopped. ShowStep() replaces it by how far it is.
  virtual void SetTitle(const std::string& title) = 0;
  virtual void ShowStep(const std::string& step) = 0;
  // Colours bar and label.
  virtual void SetColour(ProgressColour colour) = 0;
  // Sets the label; empty for none.
  virtual void SetText(const std::string& text) = 0;
};

// At most one command runs. The display shows it, then for three seconds how it ended. The bar is an animation only:
// it counts nothing and sets no time limit.
class RunningCommand {
 public:
  // `view` must outlive it.
  RunningCommand(TimerFactory& timers, CommandProgressView& view);

  // `observer` is called after each start and each end.
  void SetObserver(std::function<void()> observer) { observer_ = std::move(observer); }

  // The command that runs; nullptr when none does.
  UnitOperation* Operation() const { return operation_; }
  // Whether a command runs.
  bool Active() const { return operation_ != nullptr; }
  // What runs, for a tool tip ("Sending the configuration to unit 01"); empty when nothing does.
  const std::string& What() const { return what_; }
  // How the last command left the unit or the configuration when it did not succeed ("Unit 01: port 1 is written, 2
  // perhaps, 3 to 8 are not."); otherwise empty. Meaningful while no command runs.
  const std::string& Aftermath() const { return aftermath_; }

  // `operation` runs from now on: shows the empty bar and lets it grow. `what` as above.
  void StartCommandProgress(UnitOperation& operation, std::string what);
  // Says how far the command is ("Sending to unit 01: port 3 of 8").
  void ShowStep(const std::string& step) { view_.ShowStep(step); }
  // To be called before the command ends.
  void SetAftermath(std::string sentence) { aftermath_ = std::move(sentence); }
  // Ends the command and shows `text` in green or red for three seconds.
  void EndCommandProgress(Outcome outcome, const std::string& text);
  // Ends the command, if one runs, and leaves the display as it is. `where` becomes its title ("Stopped: channel 3:
  // 305 to 2695 cannot be sent"), if it is not empty.
  void Stop(const std::string& where = {});

 private:
  void OnTick();

  CommandProgressView& view_;
  std::unique_ptr<Timer> tmrProgress_;
  std::function<void()> observer_;
  UnitOperation* operation_ = nullptr;
  std::string what_;
  std::string aftermath_;
  std::int32_t value_ = kEnded;  // the bar's width; kEnded while an outcome is shown, or nothing

  static constexpr std::int32_t kEnded = -1;
};

}  // namespace tendril
