// LiveTest: moves the chosen channel's servo, drawn and real, by a slider and by test sweeps.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>

#include "config/channel_config.h"
#include "platform/message_boxes.h"
#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "unitops/running_command.h"
#include "unitops/unit_target.h"

namespace tendril {

// The channel that is moved; read again for every step.
class ChannelChoice {
 public:
  virtual ~ChannelChoice() = default;
  // The chosen channel, 0 to 7; nothing while none is.
  virtual std::optional<std::size_t> Channel() const = 0;
  // Its record; while none is chosen, the values that the editor shows.
  virtual ChannelConfig Values() const = 0;
};

// The drawn servos.
class ServoPictures {
 public:
  virtual ~ServoPictures() = default;
  // Moves the arm of the large servo, and of the chosen channel's small one.
  virtual void MoveArm(Microseconds position) = 0;
  // Draws the records again, with the arms at `arm`.
  virtual void UpdateSimulators(Microseconds arm) = 0;
};

// Where the slider stands, as the read-outs beside it show it.
struct SliderReadOut {
  std::int32_t percent;
  std::int32_t dmx;
  Microseconds pulse_width;
};

// The controls of the live test.
class LiveTestView {
 public:
  virtual ~LiveTestView() = default;
  // Captions of the test buttons, 0 to 4: "Stop" while the button's sweep runs, else "Test".
  virtual void ShowTestRunning(int button, bool running) = 0;
  // Slider: 0 to kSliderMaximum. Setting it runs no handler.
  virtual int SliderValue() const = 0;
  virtual void SetSlider(int value) = 0;
  virtual void ShowReadOut(const SliderReadOut& read_out) = 0;
  // "Use Slider to Test Intensity Values". Clearing it lets the test buttons be used again.
  virtual bool SliderSends() const = 0;
  virtual void ClearSliderSends() = 0;
};

// Buttons: a sweep runs through the range that its button tests in steps of 50 microseconds every 100 ms,
// rests for a second at each end, and goes on until its button is pressed again.
//
//   Idle --sweep's button: to 1500, first step after 250 ms--> Sweeping
//   Sweeping --tick: one step; clipped to the end, where it turns--> Sweeping
//   Sweeping --the same button, or a unit command starts: back to 1500--> Idle
//   Sweeping --another button--> Sweeping otherwise, or Idle
//   Sweeping --the port closes, the slider takes over, the window closes, or a fault--> Idle, where it is
//
// Slider: spans the virtual range; outside the virtual stops it is pushed back and sends nothing from there.
// Its positions go out no faster than the line takes them: one that is still waiting gives way to the next,
// and the last one always goes out, unless the records are replaced first.
//
// Nothing is sent while no channel is chosen, while no port is, and while a unit command runs.
class LiveTest {
 public:
  static constexpr int kSliderMaximum = 1000;
  static constexpr int kTestButtons = 5;
  // In the place of a button: none is pressed, all are reset.
  static constexpr int kNoButton = -1;

  // Everything handed in must outlive it.
  LiveTest(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes, const RunningCommand& running,
           const UnitTarget& target, const ChannelChoice& choice, LiveTestView& view,
           ServoPictures& pictures);

  // Button 0 to 4 was pressed: sweep the virtual range, sweep the stops, move to the default position, sweep
  // the actual range, move to the centre. kNoButton resets the captions and stops a sweep where it is. Shows
  // every failure; raises none.
  void OnTestButton(int button);
  // Ends a sweep as the second press of its button does. False: none runs.
  bool EndSweep();
  // The slider was moved, or the range that it spans has changed by an edit.
  void OnSlider();
  // The records were replaced: shows the slider again and sends nothing; a position that still waits is dropped.
  void OnRecordsReplaced();
  // "Use Slider to Test Intensity Values" was ticked or cleared.
  void OnSliderSends();
  // The link has closed its port: everything stops where it is, and a position that still waits is dropped.
  void OnPortClosed() { StopAll(); }
  // A unit command is about to start: a sweep ends as by its button, and nothing is left unsent. False: that failed,
  // and the failure has been shown.
  bool MakeWay();

  // Where the arm was drawn last, in microseconds.
  Microseconds ShownPosition() const { return shown_position_; }

 private:
  // One position for some ports of a unit.
  struct Command {
    std::uint8_t unit;
    std::uint8_t port_mask;
    std::uint8_t position;  // tenths of the pulse width
  };

  // Runs `action`; a fault stops everything here and is shown, and gives false.
  bool Guarded(const std::function<void()>& action);
  void Press(int button);
  void StopSweep();
  void StopAll();
  void Step();
  // Pushes the slider back if needed and shows where it stands; gives the position when it may be sent.
  std::optional<Microseconds> PlaceSlider();
  void ShowPosition(Microseconds position);

  std::optional<Command> LiveCommand(Microseconds position) const;
  void SendNow(Microseconds position);
  void SendPaced(Microseconds position);
  void SendWaiting();
  void Transmit(const Command& command);

  HwSerial& link_;
  MessageBoxes& boxes_;
  const RunningCommand& running_;
  const UnitTarget& target_;
  const ChannelChoice& choice_;
  LiveTestView& view_;
  ServoPictures& pictures_;
  std::unique_ptr<Timer> tmrTest_;
  std::unique_ptr<Timer> pace_timer_;  // enabled while the line is taken to be busy with a slider position

  std::optional<int> sweep_;  // the button whose sweep runs
  Microseconds test_position_ = kCentrePulseWidth;
  int direction_ = 1;  // of the sweep; 1: up, -1: down
  Microseconds shown_position_ = kCentrePulseWidth;
  std::optional<Command> waiting_;  // the slider's newest position, while the one before is on its way
};

}  // namespace tendril
