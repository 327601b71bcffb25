// Simulation: the whole program, its window included, in virtual time, with a person who does anything and a world in
// which anything goes wrong; and the rules that hold all the same.
#pragma once

#include <QString>
#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <span>
#include <string>
#include <vector>

#include "config/channel_config.h"
#include "config/option_bytes.h"
#include "serial/hw_serial.h"
#include "simulation/disturbed_line.h"
#include "simulation/random_source.h"
#include "support/find_control.h"
#include "support/simulated_control_panel.h"
#include "support/simulated_world.h"
#include "ui/frm_new_servo_config.h"

class QAbstractButton;
class QComboBox;
class QLabel;

namespace tendril::test {

// What many simulations saw together.
struct Tally {
  Counts faults;  // that the world put in
  Counts seen;    // how the program's operations ended, and what is counted apart
  std::uint64_t virtual_ms = 0;
};

// Bytes of the heap in use.
std::size_t HeapInUse();

// One run. The same seed does the same in every run of the same program.
class Simulation {
 public:
  // `narrate`: prints what happens. The tally must outlive the simulation.
  Simulation(std::uint64_t seed, Tally& tally, bool narrate);
  ~Simulation();

  // Runs it to the end, or to the first rule that does not hold, and says which; empty when all of them did.
  std::string Run();

  // Stands for all that crossed the lines, was shown, and when.
  std::uint64_t Digest() const { return digest_; }

 private:
  // Comm 1 to 4 are as they should be, 5 has no echo, 6 loses some of its echo.
  static constexpr std::array<std::int32_t, 6> kPorts = {1, 2, 3, 4, 5, 6};

  struct Place {
    std::int32_t port;
    DisturbedUnit* unit;
  };
  // One port of the send that runs.
  struct SentPort {
    OptionBytes options{};
    bool accepted = false;       // by a unit, as it was encoded
    bool damage_passed = false;  // a unit accepted something else in its place
    bool excused = false;        // the acknowledgement spoke of another command, or was damaged
  };
  // The unit command that runs.
  struct Operation {
    std::string what;
    bool running = false;
    std::size_t boxes_before = 0;
    std::string first_box = {};  // its title
    std::uint64_t last_activity_ms = 0;
    int polls = 0;          // in all
    int polls_of_step = 0;  // since the last packet that was no poll
    bool last_poll_answered = false;
    bool replies_damaged = false;
    std::size_t garbled_before = 0;  // bytes on the lines
    bool swept = false;              // a sweep ran when it was asked for
    std::array<SentPort, kPortCount> ports{};
    int port = -1;               // the slot that was sent last
    std::uint8_t unit = 0;       // that is chosen
    std::uint8_t last_poll = 0;  // its kind
    bool no_such_port = false;   // a reply spoke of one
  };

  // What goes wrong.
  void SetUpWorld();
  void ActAsWorld();
  void ChangeWeather();
  void ActAsPanel();
  void AttachUnit(std::int32_t port, std::unique_ptr<VirtualUnit> unit);
  void AttachAnyUnits(std::int32_t port);
  void DetachUnits(std::int32_t port);
  void CalmDown();

  // What the person does.
  void ActAsPerson();
  void ChoosePort(const std::string& line);
  void ChooseUnit(std::uint8_t id);
  void UseAnyControl();
  void Use(QWidget& control);
  void RunCommand(QAbstractButton& button);
  void Close();
  void WhileBoxOpen();
  void LetTimePass(std::uint64_t ms);
  std::uint64_t AnyDuration();

  // What must hold.
  void Require(bool holds, const char* rule);
  void OnWritten(std::span<const std::uint8_t> bytes);
  void OnPacket(const Bytes& packet);
  void OnOptionsSent(const Bytes& packet);
  void OnPositionSent(const Bytes& packet);
  void OnAccepted(const DisturbedUnit& unit, const Bytes& packet, bool damaged);
  void OnPollReply(bool success, std::uint8_t kind, const Bytes& data);
  void CheckTheLine();
  std::size_t CountOnLines(std::size_t LineCounters::*counter);
  void CheckOperation();
  void EndOperation();
  void CheckSend();
  void CheckGet();
  void CheckPanel();
  void CheckRecovery();

  template <typename Widget = QWidget>
  Widget& Find(const char* name) const {
    return FindControl<Widget>(*window_, name);
  }
  bool CommandRuns() const;
  bool SweepRuns() const;
  std::string Outcome() const;
  bool SummaryShown() const;
  void TakeOverNormalised();
  bool AllRecordsValid() const;
  // Without those that came up while another was open.
  std::size_t BoxesShown() const { return world_.boxes.shown.size() - boxes_on_boxes_; }
  void Note(const std::string& text);
  void Mix(std::span<const std::uint8_t> bytes);

  RandomSource random_;
  Tally& tally_;
  const bool narrate_;
  std::string broken_;  // the first rule that did not hold
  std::uint64_t digest_ = 0xcbf29ce484222325;

  SimulatedWorld world_;
  SimulatedControlPanel panel_{world_};
  Disturbance disturbance_{random_, tally_.faults};
  DisturbedDevice device_;
  HwSerial link_;
  std::unique_ptr<frmNewServoConfig> window_;

  std::vector<Place> units_;
  std::set<std::uint8_t> panel_ports_;  // that the panel has had
  bool panel_behaved_ = true;           // all the time so far
  bool panel_proper_ = true;            // it does now

  int boxes_open_ = 0;
  std::size_t boxes_on_boxes_ = 0;
  Operation operation_;
  ChannelTable records_;  // as the person left them, or a get that succeeded
  bool using_test_button_ = false;
  bool calm_ = false;  // nothing goes wrong any more
  bool closed_ = false;
  bool closing_ = false;
  bool panel_always_there_ = true;  // its listener was never gone, nor misbehaved
  bool was_connected_ = false;
  // Of the last poll.
  std::uint64_t polls_ = 0;
  std::uint64_t poll_replies_ = 0;
  std::uint64_t poll_ms_ = 0;
  std::uint64_t poll_time_out_ms_ = 0;
  bool answered_too_early_ = false;  // before it was out
  std::size_t undriven_bytes_ = 0;
  std::size_t heap_at_start_ = 0;
};

}  // namespace tendril::test
