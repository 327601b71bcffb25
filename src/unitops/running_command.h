// RunningCommand: which unit command is under way. At most one is.
#pragma once

#include <functional>
#include <string>
#include <utility>

namespace tendril {

// The commands begin and end it; the window disables what must not be used meanwhile.
class RunningCommand {
 public:
  // Who is told of each change; called after it.
  void SetObserver(std::function<void()> observer) { observer_ = std::move(observer); }

  // What runs, in the words of a tool tip ("Sending the configuration to unit 01"); empty when nothing does.
  const std::string& What() const { return what_; }
  // Whether a command is under way.
  bool Active() const { return !what_.empty(); }

  // `what` is not empty.
  void Begin(std::string what) { Change(std::move(what)); }
  // Does nothing when nothing runs.
  void End() {
    if (Active()) Change({});
  }

 private:
  void Change(std::string what) {
    what_ = std::move(what);
    if (observer_) observer_();
  }

  std::string what_;
  std::function<void()> observer_;
};

}  // namespace tendril
