// WindowFacts: what moves and how the chosen unit answers, as the status bar shows it.
#pragma once

#include <cstdint>
#include <optional>

#include "serial/hw_serial.h"
#include "ui/live_test_area.h"
#include "ui/model/moving.h"
#include "ui/model/unit_answers.h"
#include "ui/status_line.h"
#include "unitops/live_test.h"
#include "unitops/running_command.h"
#include "unitops/unit_target.h"

namespace tendril {

// Gathers the facts from those who have them. Whoever changes one calls Show().
class WindowFacts {
 public:
  // All must outlive it.
  WindowFacts(const HwSerial& link, const UnitTarget& target, const ChannelChoice& choice,
              const RunningCommand& running, const LiveTestArea& live_test, StatusLine& status)
      : link_(link),
        target_(target),
        choice_(choice),
        running_(running),
        live_test_(live_test),
        status_(status) {}

  // Shows the facts as they are now. Cheap while they are the same.
  void Show();
  // `unit` was polled, and has replied or not. Shows that.
  void NotePoll(std::uint8_t unit, bool replied);
  // Whether a servo test runs, or the slider moves the servo.
  bool AnythingMoves() const { return Moving().moves != Moves::kNothing; }
  // UnitAnswers::Missing() of the chosen unit.
  bool UnitMissing() const { return answers_.Missing(link_.CommPort(), target_.UnitId()); }

 private:
  MovingFacts Moving() const;

  const HwSerial& link_;
  const UnitTarget& target_;
  const ChannelChoice& choice_;
  const RunningCommand& running_;
  const LiveTestArea& live_test_;
  StatusLine& status_;
  UnitAnswers answers_;
  std::optional<MovingFacts> shown_;
};

}  // namespace tendril
