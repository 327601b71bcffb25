#include "unitops/live_test.h"

#include <algorithm>
#include <string>
#include <utility>

#include "config/option_bytes.h"
#include "platform/rounding.h"
#include "platform/runtime_error.h"
#include "unitops/unit_operation.h"

namespace tendril {
namespace {

// What the test buttons do, by index.
enum TestButton { kSweepVirtualRange, kSweepStops, kToDefault, kSweepActualRange, kToCentre };

constexpr Microseconds kSweepStep = 50;
constexpr std::int32_t kFirstStepMs = 250;
constexpr std::int32_t kStepMs = 100;
constexpr std::int32_t kRestMs = 1000;

// A live command is 15 or 16 bytes with its unlock: up to 8.3 ms on the line.
constexpr std::int32_t kCommandOnLineMs = 9;

constexpr std::uint8_t kLiveEnd = 255;  // the last option byte of a live command
constexpr std::int32_t kMaxDmx = 255;

double SliderFraction(int slider) { return static_cast<double>(slider) / LiveTest::kSliderMaximum; }

Microseconds SliderPulseWidth(const PulsePair& range, int slider) {
  return range[0] + RoundHalfToEven(SliderFraction(slider) * (range[1] - range[0]));
}

// A position as it is sent.
std::int32_t Tenths(Microseconds position) { return RoundHalfToEven(position / 10.0); }

const PulsePair& SweptRange(const ChannelConfig& values, int button) {
  switch (button) {
    case kSweepVirtualRange:
      return values.VirtualRange;
    case kSweepStops:
      return values.VirtualStops;
    default:
      return values.ActualRange;
  }
}

}  // namespace

LiveTest::LiveTest(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes, const RunningCommand& running,
                   const UnitTarget& target, const ChannelChoice& choice, LiveTestView& view,
                   ServoPictures& pictures)
    : link_(link),
      boxes_(boxes),
      running_(running),
      target_(target),
      choice_(choice),
      view_(view),
      pictures_(pictures),
      tmrTest_(timers.CreateTimer([this] { Guarded([this] { Step(); }); })),
      pace_timer_(timers.CreateTimer([this] {
        if (!waiting_) pace_timer_->SetEnabled(false);
        Guarded([this] { SendWaiting(); });
      })) {
  pace_timer_->SetInterval(kCommandOnLineMs);
}

bool LiveTest::Guarded(const std::function<void()>& action) {
  try {
    action();
    return true;
  } catch (...) {
    const std::string fault = DescribeCurrentFault();
    StopAll();
    view_.ClearSliderSends();  // otherwise the next movement would fail and show a box again
    ShowCommError(boxes_, {}, fault);
    return false;
  }
}

void LiveTest::OnTestButton(int button) {
  Guarded([&] { Press(button); });
}

bool LiveTest::EndSweep() {
  if (!sweep_) return false;
  OnTestButton(*sweep_);
  return true;
}

void LiveTest::Press(int button) {
  const bool was_running = sweep_ == button;
  StopSweep();
  if (was_running || button == kToCentre) {
    ShowPosition(kCentrePulseWidth);
  } else if (button == kToDefault) {
    ShowPosition(choice_.Values().DefaultPosition);
  } else if (button != kNoButton) {
    sweep_ = button;
    view_.ShowTestRunning(button, true);
    test_position_ = kCentrePulseWidth;
    direction_ = 1;
    tmrTest_->SetInterval(kFirstStepMs);
    tmrTest_->SetEnabled(true);
    ShowPosition(kCentrePulseWidth);
  } else {
    return;
  }
  SendNow(shown_position_);
}

// Where it is, with all captions back.
void LiveTest::StopSweep() {
  for (int button = 0; button < kTestButtons; ++button) view_.ShowTestRunning(button, false);
  tmrTest_->SetEnabled(false);
  sweep_.reset();
}

// The same, and nothing waits to be sent any more.
void LiveTest::StopAll() {
  StopSweep();
  pace_timer_->SetEnabled(false);
  waiting_.reset();
}

void LiveTest::Step() {
  if (!sweep_) return;
  const ChannelConfig values = choice_.Values();
  const auto [low, high] = SweptRange(values, *sweep_);
  test_position_ += direction_ * kSweepStep;
  const Microseconds end = direction_ > 0 ? high : low;
  const bool at_end = direction_ * (test_position_ - end) >= 0;
  if (at_end) {
    test_position_ = end;
    direction_ = -direction_;
  }
  const std::int32_t interval_ms = at_end ? kRestMs : kStepMs;
  // Setting it at every step would add each step's lateness to the next one's.
  if (tmrTest_->Interval() != interval_ms) tmrTest_->SetInterval(interval_ms);
  ShowPosition(test_position_);
  SendNow(test_position_);
}

void LiveTest::ShowPosition(Microseconds position) {
  shown_position_ = position;
  pictures_.MoveArm(position);
}

void LiveTest::OnSlider() {
  Guarded([this] {
    const auto position = PlaceSlider();
    if (position && view_.SliderSends()) SendPaced(*position);
  });
}

void LiveTest::OnRecordsReplaced() {
  waiting_.reset();  // it was meant for the records as they were
  Guarded([this] { PlaceSlider(); });
}

std::optional<Microseconds> LiveTest::PlaceSlider() {
  const ChannelConfig values = choice_.Values();
  const auto position_at = [&](int slider) { return SliderPulseWidth(values.VirtualRange, slider); };
  const PulsePair& stops = values.VirtualStops;
  // The way back between the stops; 0 inside them. What is sent is rounded, and must lie inside too.
  const auto way_back = [&](int slider) {
    const Microseconds position = position_at(slider);
    const Microseconds sent = Tenths(position) * 10;
    return std::min(position, sent) < stops[0] ? 1 : std::max(position, sent) > stops[1] ? -1 : 0;
  };

  int slider = view_.SliderValue();
  const int step = way_back(slider);
  int pushed = slider;
  while (pushed >= 0 && pushed <= kSliderMaximum && way_back(pushed) != 0) pushed += step;
  const bool may_send = pushed >= 0 && pushed <= kSliderMaximum;
  if (may_send && step != 0) view_.SetSlider(slider = pushed);

  shown_position_ = position_at(slider);
  const double fraction = SliderFraction(slider);
  view_.ShowReadOut({RoundHalfToEven(fraction * 100), RoundHalfToEven(fraction * kMaxDmx), shown_position_});
  pictures_.UpdateSimulators(shown_position_);
  return may_send ? std::optional(shown_position_) : std::nullopt;
}

void LiveTest::OnSliderSends() {
  if (view_.SliderSends()) OnTestButton(kNoButton);
}

bool LiveTest::MakeWay() {
  return Guarded([this] {
    if (sweep_) {
      Press(*sweep_);
    } else {
      SendWaiting();
    }
  });
}

// The position as the ports of the choice would be given it; nothing when nothing may be sent. Raises
// kErrOverflow for a position that no unit knows.
std::optional<LiveTest::Command> LiveTest::LiveCommand(Microseconds position) const {
  const std::optional<std::size_t> channel = choice_.Channel();
  if (!channel || *channel >= kPortCount || link_.CommPort() == 0 || running_.Active()) return std::nullopt;
  const std::int32_t tenths = Tenths(position);
  if (tenths < kMinPulseWidth / 10 || tenths > kMaxPulseWidth / 10) {
    throw RuntimeError(kErrOverflow, "Overflow");
  }
  return Command{target_.UnitId(), static_cast<std::uint8_t>(1u << *channel),
                 static_cast<std::uint8_t>(tenths)};
}

void LiveTest::SendNow(Microseconds position) {
  SendWaiting();
  if (const auto command = LiveCommand(position)) Transmit(*command);
}

void LiveTest::SendPaced(Microseconds position) {
  const auto command = LiveCommand(position);
  if (!command) return;
  // Only a newer position of the same servo takes the place of one that waits.
  if (waiting_ && (waiting_->unit != command->unit || waiting_->port_mask != command->port_mask)) {
    SendWaiting();
  }
  if (pace_timer_->Enabled()) {
    waiting_ = command;
  } else {
    pace_timer_->SetEnabled(true);
    Transmit(*command);
  }
}

void LiveTest::SendWaiting() {
  if (waiting_) Transmit(*std::exchange(waiting_, std::nullopt));
}

void LiveTest::Transmit(const Command& command) {
  link_.cmdSetoption(command.unit, 0, kOptionServoPort, kLivePosition, command.port_mask, command.position,
                     kLiveEnd);
}

}  // namespace tendril
