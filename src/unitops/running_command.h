// RunningCommand: which unit command is under way. At most one is.
#pragma once

#include <functional>
#include <string>
#include <utility>

namespace tendril {

enum class UnitCommand { kNone, kSend, kGet, kChangeId };

// The commands begin and end it; the window disables what must not be used meanwhile.
class RunningCommand {
 public:
  // Who is told of each change; called after it.
  void SetObserver(std::function<void()> observer) { observer_ = std::move(observer); }

  // Which command is under way.
  UnitCommand Which() const { return which_; }
  // What runs, in the words of a tool tip ("Sending the configuration to unit 01"); empty when nothing does.
  const std::string& What() const { return what_; }
  // Whether a command is under way.
  bool Active() const { return which_ != UnitCommand::kNone; }

  // `which` runs from now on; `what` as above.
  void Begin(UnitCommand which, std::string what) { Change(which, std::move(what)); }
  // Does nothing when nothing runs. `stopped`: where it stopped, and why, when no outcome is shown ("Stopped: channel
  // 3: 305 to 2695 cannot be sent").
  void End(std::string stopped = {}) {
    if (!Active()) return;
    stopped_ = std::move(stopped);
    Change(UnitCommand::kNone, {});
  }
  // Where the command that ended last stopped; empty for one that showed its outcome.
  const std::string& Stopped() const { return stopped_; }

 private:
  void Change(UnitCommand which, std::string what) {
    which_ = which;
    what_ = std::move(what);
    if (observer_) observer_();
  }

  UnitCommand which_ = UnitCommand::kNone;
  std::string what_;
  std::string stopped_;  // meaningful while no command is under way
  std::function<void()> observer_;
};

}  // namespace tendril
