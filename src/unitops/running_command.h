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
  // Does nothing when nothing runs.
  void End() {
    if (Active()) Change(UnitCommand::kNone, {});
  }

 private:
  void Change(UnitCommand which, std::string what) {
    which_ = which;
    what_ = std::move(what);
    if (observer_) observer_();
  }

  UnitCommand which_ = UnitCommand::kNone;
  std::string what_;
  std::function<void()> observer_;
};

}  // namespace tendril
