// Simulation: the whole program, its window included, in virtual time, with a user who does anything and a world in which
// anything goes wrong; and the rules that hold all the same.
#pragma once

#include <QPointer>
#include <QWidget>
#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "config/channel_config.h"
#include "config/option_bytes.h"
#include "serial/hw_serial.h"
#include "simulation/disturbed_unit.h"
#include "simulation/random_source.h"
#include "support/counting_device.h"
#include "support/find_control.h"
#include "support/simulated_control_panel.h"
#include "support/simulated_world.h"
#include "ui/frm_new_servo_config.h"

class QAbstractButton;

namespace tendril::test {

// One run. The same seed does the same in every run of the same program.
class Simulation {
 public:
  // `narrate`: prints what happens.
  Simulation(std::uint64_t seed, bool narrate);
  ~Simulation();

  // Runs to the end, or to the first rule that does not hold, and returns that rule; empty when all of them held.
  std::string Run();
  std::uint64_t VirtualMs() const { return world_.time.ElapsedMs(); }

 private:
  // Comm 1 to 4 are as they should be, 5 has no echo, 6 loses some of its echo.
  static constexpr std::array<std::int32_t, 6> kPorts = {1, 2, 3, 4, 5, 6};

  struct Place {
    std::int32_t port;
    DisturbedUnit* unit;
  };
  // The unit command that runs, or ran last.
  struct Operation {
    std::string what = {};
    int max_polls = 0;  // of one step
    std::int32_t comm_port = 0;
    bool running = false;
    bool swept = false;      // a sweep ran when the command was pressed
    bool cancelled = false;  // perhaps
    std::uint8_t unit = 0;
    std::size_t boxes_before = 0;
    std::uint64_t last_activity_ms = 0;
    int polls_of_step = 0;  // since the last packet that was no poll
    std::size_t ports = 0;  // sent so far
    std::array<OptionBytes, kPortCount> options = {};
    std::uint8_t last_poll = 0;
    bool last_poll_answered = false;
  };

  // What goes wrong.
  void SetUpWorld();
  void ActAsWorld();
  void MakeNoise(std::int32_t port);
  void ActAsPanel();
  void AttachUnit(std::int32_t port, std::unique_ptr<VirtualUnit> unit);
  void AttachAnyUnits(std::int32_t port);
  void DetachUnits(std::int32_t port);
  void CalmDown();

  // What the user does.
  void ActAsUser();
  void ChoosePort(int number);
  void ChooseUnit(std::uint8_t id);
  void UseSlider();
  void UseAnyControl();
  void TypeAnything();
  void PressEscape();
  void UndoOrRedo();
  void CopyOrPaste();
  void Use(QWidget& control);
  void RunCommand(QAbstractButton& button);
  void Close();
  void WhileBoxOpen();
  void LetTimePass(std::uint64_t ms);
  std::uint64_t AnyDuration();

  // What must hold.
  void Require(bool holds, std::string_view rule);
  void OnWritten(std::span<const std::uint8_t> bytes);
  void OnPacket(const Bytes& packet);
  void OnOptionsSent(const Bytes& packet);
  void OnPositionSent(const Bytes& packet);
  void OnPollReply(bool success, const Bytes& data);
  void Check();
  void CheckCommand();
  void EndOperation();
  void CheckData();
  void CheckRecovery();

  // Searched for once: the rules look at some controls after each tick.
  template <typename Widget = QWidget>
  Widget& Find(const char* name) const {
    QPointer<QWidget>& control = controls_[name];
    if (control == nullptr) control = &FindControl<QWidget>(*window_, name);
    return dynamic_cast<Widget&>(*control);
  }
  bool CommandRuns() const;
  bool SweepRuns() const;
  bool SummaryShown() const;
  bool AllRecordsValid() const;
  bool Usable(const QWidget& control) const {
    return control.isEnabledTo(window_.get()) && control.isVisibleTo(window_.get());
  }
  std::int32_t OpenPort() const { return link_.PortOpen() ? link_.CommPort() : 0; }
  bool PollOutstanding() const { return polls_ != poll_replies_; }
  // Without those that came up while another was open.
  std::size_t BoxesShown() const { return world_.boxes.shown.size() - boxes_on_boxes_; }
  void Note(const std::string& text) const;

  RandomSource random_;
  const bool narrate_;
  // No byte is damaged, no line has more than one unit, and each unit answers in time. Only then all data can be checked:
  // replies have no checksum.
  const bool plain_;
  std::string broken_;  // the first rule that did not hold

  SimulatedWorld world_;
  SimulatedControlPanel panel_{world_};
  Weather weather_;
  CountingDevice device_{*world_.device};
  HwSerial link_{device_, world_.time, world_.time, world_.log};
  std::unique_ptr<frmNewServoConfig> window_;
  mutable std::map<std::string_view, QPointer<QWidget>> controls_;

  std::vector<Place> units_;
  std::set<std::uint8_t> panel_ports_;  // that the panel has had
  bool panel_behaved_ = true;           // all the time so far
  int boxes_open_ = 0;
  std::size_t boxes_on_boxes_ = 0;
  Operation operation_;
  std::optional<ChannelTable> copied_;
  ChannelTable records_;  // as the user left them, or a get that succeeded
  bool using_test_button_ = false;
  bool undoing_ = false;  // or copying, or pasting
  bool calm_ = false;     // nothing goes wrong any more
  bool closed_ = false;
  std::uint64_t polls_ = 0;
  std::uint64_t poll_replies_ = 0;
};

}  // namespace tendril::test
