// How close the program comes, over a paced pseudo-terminal, to the times that the protocol itself sets: a
// send, a get, a search for units, and the steps of a test sweep.
#include <QAbstractButton>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <span>
#include <stdexcept>
#include <vector>

#include "bench/virtual_unit.h"
#include "config/option_bytes.h"
#include "measured_window.h"
#include "measuring.h"
#include "simulator/servo_simulator.h"

namespace tendril {
namespace {

constexpr double kWireMsPerByte = 10 * 1000.0 / 19200;

constexpr std::size_t kCode = 2;  // where a packet has its code
constexpr std::uint8_t kPoll = 0x88;
constexpr std::uint8_t kSetOption = 0x0A;

double WireMs(std::size_t bytes) { return static_cast<double>(bytes) * kWireMsPerByte; }

// Eight ports. The floor: what is on the wire, and the eight steps of 300 ms.
bool MeasureSend(MeasuredWindow& window) {
  constexpr int kRuns = 5;
  constexpr double kStepsMs = 8 * 300.0;
  constexpr double kMaxRatio = 1.02;

  std::vector<double> measured_ms, floor_ms, ratio;
  for (int run = 0; run < kRuns; ++run) {
    measured_ms.push_back(window.RunCommand("Command3_0", "SUCCESS: Send Complete!"));
    floor_ms.push_back(WireMs(window.device.received) + kStepsMs);
    ratio.push_back(measured_ms.back() / floor_ms.back());
  }
  std::printf(
      "send, median of %d: %zu bytes on the wire, measured %.1f ms, floor %.1f ms, ratio %.4f (at most "
      "%.2f)\n",
      kRuns, window.device.received, Median(measured_ms), Median(floor_ms), Median(ratio), kMaxRatio);
  return Median(ratio) <= kMaxRatio;
}

// The floor: what is on the wire until the last reply has ended, and the unit's turn-round after each poll. The
// two zero bytes with which the program takes the line back are on the wire in front of the next poll; those
// after the last reply are not waited for.
bool MeasureGet(MeasuredWindow& window) {
  constexpr int kRuns = 11;
  constexpr int kPolls = 8;
  constexpr double kTurnRoundMs = static_cast<double>(ReplyTiming().turn_round_us) / 1000;
  constexpr double kMaxExcessMs = 1.5;  // per poll

  int polls = 0;
  window.device.on_write = [&polls](std::span<const std::uint8_t> packet) {
    if (packet.size() > kCode && packet[kCode] == kPoll) ++polls;
  };
  std::vector<double> measured_ms, floor_ms, excess_ms;
  for (int run = 0; run < kRuns; ++run) {
    polls = 0;
    measured_ms.push_back(window.RunCommand("Command3_1", "SUCCESS: Upload Complete"));
    if (polls != kPolls) throw std::runtime_error("The get does not take one poll a port");
    floor_ms.push_back(WireMs(window.device.received) + kPolls * kTurnRoundMs);
    excess_ms.push_back((measured_ms.back() - floor_ms.back()) / kPolls);
  }
  window.device.on_write = nullptr;
  std::printf(
      "get, median of %d: %d polls, %zu bytes on the wire, measured %.1f ms, floor %.1f ms, "
      "excess %.2f ms per poll (at most %.1f)\n",
      kRuns, kPolls, window.device.received, Median(measured_ms), Median(floor_ms), Median(excess_ms),
      kMaxExcessMs);
  return Median(excess_ms) <= kMaxExcessMs;
}

// The floor: the time-outs of the 252 IDs without a unit, which grow by the bytes that wait when they begin.
bool MeasureFind(MeasuredWindow& window) {
  constexpr double kTimeOutBytes = 38 + 45;
  constexpr int kUnanswered = 252;
  constexpr double kMaxRatio = 1.02;

  const double measured_ms = window.RunCommand("cmdFindUnits", "SUCCESS: Search Complete");
  const double floor_ms =
      2 * kWireMsPerByte * (kUnanswered * kTimeOutBytes + static_cast<double>(window.device.pended));
  std::printf("find: measured %.1f ms, floor %.1f ms, ratio %.4f (at most %.2f)\n", measured_ms, floor_ms,
              measured_ms / floor_ms, kMaxRatio);
  return measured_ms / floor_ms <= kMaxRatio;
}

// A live command, when it was written.
struct LiveStep {
  double ms;
  std::uint8_t tenths;
};

std::vector<LiveStep> RecordSweep(MeasuredWindow& window, int for_ms) {
  std::vector<LiveStep> steps;
  const Stopwatch stopwatch;
  window.device.on_write = [&](std::span<const std::uint8_t> packet) {
    if (packet.size() > 6 && packet[kCode] == kSetOption && packet[3] == kOptionServoPort &&
        packet[4] == kLivePosition) {
      steps.push_back({stopwatch.Ms(), packet[6]});
    }
  };
  auto& button = window.Child<QAbstractButton>("cmdTest_0");
  button.click();
  MeasuredWindow::RunFor(for_ms);
  window.device.on_write = nullptr;
  button.click();
  return steps;
}

// A sweep of channel 1 through the virtual range that it has at the start, 1000 to 2000: the first step comes
// 250 ms after the button's own 1500, the next after 100 ms each, or a second at either end. Each rest is counted
// from the step that begins it, so that the sweep as a whole may fall behind by the lateness of these.
bool MeasureSweep(MeasuredWindow& window) {
  constexpr int kForMs = 8000;
  constexpr std::size_t kLeastSteps = 50;
  constexpr double kMaxLateMs = 5;
  constexpr int kLow = 100, kHigh = 200, kCentre = 150, kStep = 5;

  Q_EMIT window.Child<ServoSimulator>("ServoSimulator2_0").Clicked();
  const std::vector<LiveStep> steps = RecordSweep(window, kForMs);
  if (steps.size() < kLeastSteps) throw std::runtime_error("The sweep makes too few steps");

  std::vector<double> late_after_step, late_after_start;
  int position = kCentre;
  int direction = kStep;
  double wait_ms = 250;
  double due_ms = steps[0].ms;
  for (std::size_t i = 1; i < steps.size(); ++i) {
    position += direction;
    if (steps[i].tenths != position) throw std::runtime_error("The sweep makes a wrong step");
    due_ms += wait_ms;
    late_after_start.push_back(steps[i].ms - due_ms);
    late_after_step.push_back(steps[i].ms - steps[i - 1].ms - wait_ms);
    const bool at_end = position == kLow || position == kHigh;
    wait_ms = at_end ? 1000 : 100;
    if (at_end) direction = -direction;
  }
  std::printf(
      "sweep, median of %zu steps: late by %.2f ms counted from the step before (at most %.1f); by %.2f ms "
      "counted from the start\n",
      late_after_step.size(), Median(late_after_step), kMaxLateMs, Median(late_after_start));
  return Median(late_after_step) <= kMaxLateMs;
}

bool MeasureAll() {
  MeasuredWindow window;
  bool within_bounds = true;
  for (const auto measure : {MeasureSend, MeasureGet, MeasureFind, MeasureSweep})
    within_bounds &= measure(window);
  window.ShowFullLine();
  std::puts("with the line shown, and its trace full:");
  for (const auto measure : {MeasureSend, MeasureGet, MeasureSweep}) within_bounds &= measure(window);
  return within_bounds;
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::MeasureAll); }
