// CommandTest: the unit commands on a bench, in simulated time.
#pragma once

#include <gmock/gmock.h>

#include <memory>
#include <string>
#include <utility>

#include "platform/hex_text.h"
#include "serial/hw_serial.h"
#include "support/recorded_progress.h"
#include "support/simulated_world.h"
#include "unitops/unit_commands.h"

namespace tendril::test {

struct ChosenTarget final : public UnitTarget {
  bool PortChosen() const override { return port_chosen; }
  std::uint8_t UnitId() const override { return unit; }
  bool port_chosen = true;
  std::uint8_t unit = 0x01;
};

// Answers every poll with the same data.
class ScriptedUnit final : public VirtualUnit {
 public:
  ScriptedUnit(std::uint8_t id, Bytes data) : VirtualUnit(id), data_(std::move(data)) {}

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t /*kind*/) override { return data_; }

 private:
  Bytes data_;
};

// Comm 1 and unit 01 are chosen, and no unit is on the line. The records are those of the start.
class CommandTest : public testing::Test {
 protected:
  CommandTest() {
    link_.SetLineObserver([this](const LineEvent& event) { trace_.Note(event, 0); });
    link_.SetCommPort(1);
    link_.SetBaudRate(19200);
    for (std::size_t slot = 0; slot < kPortCount; ++slot)
      SetFromPreset(kPresets[kStartPreset], working_.At(slot));
    commands_.running.SetReporter([this](const CommandReport& report) { said_ = report.Sentence("14:05"); });
    // A box runs the event loop: the command has ended and shows it before one opens.
    world_.boxes.while_open = [this] {
      settled_at_the_box_ = !commands_.running.Active() && progress_.colour == ProgressColour::kRed;
    };
  }

  // Lets the command run until it has ended.
  void RunToTheEnd() {
    constexpr std::uint64_t kLongestMs = 12000;
    ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !commands_.running.Active(); }, kLongestMs));
  }
  // What the program puts on the line of Comm 1 meanwhile.
  Bytes Sent(const std::function<void()>& action) {
    Bytes bytes;
    world_.bench.Line(1).SetTap([&](const LineByte& byte) {
      if (byte.from == LineSide::kProgram) bytes.push_back(byte.value);
    });
    action();
    world_.bench.Line(1).SetTap(nullptr);
    return bytes;
  }
  void Run(UnitOperation& operation) {
    operation.Start();
    RunToTheEnd();
  }
  void ExpectFailure(const testing::Matcher<const BoxMessage&>& box) {
    EXPECT_THAT(world_.boxes.Take(), testing::ElementsAre(box));
    EXPECT_TRUE(progress_.shown);
    EXPECT_EQ(progress_.text, "COMMAND FAILED!");
    EXPECT_TRUE(std::exchange(settled_at_the_box_, false));
  }
  void ExpectFailure(const BoxMessage& box) {
    ExpectFailure(testing::Matcher<const BoxMessage&>(testing::Eq(box)));
  }
  // A box of this title whose text begins like this: it goes on with where the fault happened.
  static testing::Matcher<const BoxMessage&> Fault(const std::string& title, const std::string& text) {
    return testing::AllOf(testing::Field(&BoxMessage::title, title),
                          testing::Field(&BoxMessage::text, testing::StartsWith(text)));
  }
  void ExpectSuccess(const std::string& text) {
    EXPECT_THAT(world_.boxes.Take(), testing::IsEmpty());
    EXPECT_TRUE(progress_.shown);
    EXPECT_EQ(progress_.text, text);
    EXPECT_EQ(progress_.colour, ProgressColour::kGreen);
  }

  SimulatedWorld world_;
  LineTrace trace_;
  HwSerial link_{*world_.device, world_.time, world_.time, world_.log};
  RecordedProgress progress_;
  bool settled_at_the_box_ = false;
  std::string said_;  // the last report
  ChosenTarget target_;
  ChannelTable working_;
  std::function<bool()> on_starting_ = [] { return true; };
  std::function<void()> on_replaced_ = [] {};
  OptionTable held_{};  // by the unit that was compared last
  std::string
      noted_;  // by events: "01+ 01- sent 01 " when a unit has replied to a poll, then not, and was sent to
  UnitCommands::Events events_{
      .starting = [this] { return on_starting_(); },
      .polled = [this](std::uint8_t unit,
                       bool replied) { noted_ += HexByte(unit) + (replied ? "+ " : "- "); },
      .replaced =
          [this](std::uint8_t unit) {
            noted_ += "replaced " + HexByte(unit) + " ";
            on_replaced_();
          },
      .sent = [this](std::uint8_t unit) { noted_ += "sent " + HexByte(unit) + " "; },
      .compared =
          [this](std::uint8_t unit, const OptionTable& held) {
            noted_ += "compared " + HexByte(unit) + " ";
            held_ = held;
          }};

  UnitCommands commands_{link_, trace_, world_.time, world_.boxes, progress_, target_, working_, events_};
};

}  // namespace tendril::test
