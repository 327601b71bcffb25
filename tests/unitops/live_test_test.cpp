#include "unitops/live_test.h"

#include <array>
#include <optional>
#include <tuple>
#include <utility>
#include <vector>

#include "command_fixture.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

struct FakeChoice final : public ChannelChoice {
  std::optional<std::size_t> Channel() const override { return channel; }
  ChannelConfig Values() const override { return values; }
  std::optional<std::size_t> channel = 2;
  ChannelConfig values;
};

struct FakeView final : public LiveTestView {
  void ShowTestRunning(int button, bool running) override {
    captions[static_cast<std::size_t>(button)] = running;
  }
  int SliderValue() const override { return slider; }
  void SetSlider(int value) override { slider = value; }
  void ShowReadOut(const SliderReadOut& now) override { read_out = now; }
  bool SliderSends() const override { return sends; }
  void ClearSliderSends() override { sends = false; }

  std::array<bool, LiveTest::kTestButtons> captions{};
  int slider = 500;
  bool sends = false;
  SliderReadOut read_out{};
};

struct FakePictures final : public ServoPictures {
  void MoveArm(Microseconds position) override { drawn.push_back(position); }
  void UpdateSimulators(Microseconds arm) override {
    ++updates;
    updated_to = arm;
  }
  std::vector<Microseconds> drawn;
  int updates = 0;
  Microseconds updated_to = 0;
};

// A live command as it crossed the line.
struct LiveCommand {
  std::uint64_t ms;  // when it was written, since the test's start
  int unit, mask, position;
};

class Live : public CommandTest {
 protected:
  Live() {
    on_starting_ = [this] { return test_.MakeWay(); };
    link_.SetPortHandler([this](bool open) {
      if (!open) test_.OnPortClosed();
    });
    choice_.values = working_.At(2);
    choice_.values.NeutralPosition = 1600;  // no movement begins or ends there
    world_.bench.Line(1).SetTap([this](const LineByte& byte) { Hear(byte); });
  }

  // Collects live commands: an unlock, then 0A 11 89 <mask> <position> FF <checksum>.
  void Hear(const LineByte& byte) {
    if (byte.from != LineSide::kProgram) return;
    if (byte.value != 0) {
      packet_.push_back(byte.value);
      return;
    }
    if (packet_.empty()) started_us_ = byte.at_us - 521;  // the first bit of the first zero
    const Bytes packet = std::exchange(packet_, {});
    if (packet.size() == 3 && packet[1] == 0x8A) unlock_us_ = started_us_;
    if (packet.size() < 8 || packet[1] != 0x0A || packet[3] != 137) return;
    EXPECT_EQ(packet[2], 17);
    EXPECT_EQ(packet[6], 255);
    const std::uint64_t unlock_ms = (unlock_us_ + 500) / 1000;
    sent_.push_back({unlock_ms, packet[0], packet[4], packet[5]});
  }
  std::vector<int> SentPositions() {
    std::vector<int> positions;
    for (const LiveCommand& command : sent_) positions.push_back(command.position);
    return positions;
  }
  // Lets what is on its way arrive.
  void Settle() { world_.time.Advance(50); }
  void MoveSliderTo(int value) {
    view_.slider = value;
    test_.OnSlider();
  }
  // 140 goes out, 142 waits.
  void Drag() {
    sent_.clear();
    for (const int value : {400, 410, 420}) MoveSliderTo(value);
  }
  void SetSliderSends(bool sends) {
    view_.sends = sends;
    test_.OnSliderSends();
  }

  ~Live() override { link_.SetPortHandler(nullptr); }

  FakeChoice choice_;
  FakeView view_;
  FakePictures pictures_;
  std::vector<LiveCommand> sent_;
  LiveTest test_{link_, world_.time, world_.boxes, commands_.running, target_, choice_, view_, pictures_};

 private:
  Bytes packet_;
  std::uint64_t started_us_ = 0;
  std::uint64_t unlock_us_ = 0;
};

TEST_F(Live, Sweep_StepsAndRestsToTheMillisecond) {
  choice_.values.VirtualStops = {1430, 1640};
  auto& unit = world_.Attach("", 0x01);
  test_.OnTestButton(1);
  EXPECT_TRUE(view_.captions[1]);
  world_.time.Advance(2900);
  std::vector<std::pair<std::uint64_t, int>> sent;
  for (const LiveCommand& command : sent_) sent.emplace_back(command.ms, command.position);
  using At = std::pair<std::uint64_t, int>;
  // Each end is reached exactly, and rested at.
  EXPECT_THAT(sent, ElementsAre(At(0, 150), At(250, 155), At(350, 160), At(450, 164), At(1450, 159),
                                At(1550, 154), At(1650, 149), At(1750, 144), At(1850, 143), At(2850, 148)));
  EXPECT_EQ(pictures_.drawn[3], 1640);

  test_.OnTestButton(1);
  world_.time.Advance(5000);
  EXPECT_EQ(unit.LivePosition(3), 150);
  EXPECT_EQ(test_.ShownPosition(), 1500);
  EXPECT_EQ(world_.time.RunningTimers(), 0);
  EXPECT_EQ(unit.rejected_commands(), 0u);
}

TEST_F(Live, Sweeps_GoThroughTheRangeOfTheirButton) {
  choice_.values.ActualRange = {710, 2290};
  choice_.values.VirtualRange = {1000, 2000};
  for (const auto& [button, ends] : {std::pair(0, std::pair(100, 200)), std::pair(3, std::pair(71, 229))}) {
    sent_.clear();
    test_.OnTestButton(button);
    world_.time.Advance(20000);
    const std::vector<int> positions = SentPositions();
    const auto [lowest, highest] = std::minmax_element(positions.begin(), positions.end());
    EXPECT_EQ(std::pair(*lowest, *highest), ends);
    test_.OnTestButton(button);
  }
}

TEST_F(Live, Buttons_SwitchMoveAndReset) {
  choice_.values.DefaultPosition = 1515;
  test_.OnTestButton(0);
  world_.time.Advance(300);
  choice_.channel = 7;  // the sweep goes on with it
  world_.time.Advance(150);
  test_.OnTestButton(3);  // another sweep begins in the middle again
  EXPECT_THAT(view_.captions, ElementsAre(false, false, false, true, false));
  world_.time.Advance(260);
  test_.OnTestButton(2);  // a single move ends a sweep
  EXPECT_THAT(view_.captions, testing::Each(false));
  Settle();
  test_.OnTestButton(4);
  world_.time.Advance(2000);
  EXPECT_THAT(SentPositions(), ElementsAre(150, 155, 160, 165, 150, 155, 152, 150));
  EXPECT_EQ(sent_[2].mask, 128);
  EXPECT_THAT(pictures_.drawn, ElementsAre(1500, 1550, 1600, 1650, 1500, 1550, 1515, 1500));

  // A sweep that was stopped on its way down begins upwards again.
  sent_.clear();
  choice_.values.VirtualStops = {1400, 1600};
  test_.OnTestButton(1);
  world_.time.Advance(1500);  // 155 160, and after the rest 155 150
  test_.OnTestButton(1);
  test_.OnTestButton(1);
  world_.time.Advance(300);
  EXPECT_THAT(SentPositions(), ElementsAre(150, 155, 160, 155, 150, 150, 150, 155));

  // No button, or the slider that takes over: everything is reset where it is, nothing is moved or sent.
  for (const bool slider_takes_over : {false, true}) {
    test_.OnTestButton(0);
    world_.time.Advance(260);
    sent_.clear();
    slider_takes_over ? SetSliderSends(true) : test_.OnTestButton(LiveTest::kNoButton);
    world_.time.Advance(2000);
    EXPECT_THAT(view_.captions, testing::Each(false));
    EXPECT_THAT(sent_, IsEmpty());
    EXPECT_EQ(test_.ShownPosition(), 1550);
  }
}

TEST_F(Live, Slider_SpansTheVirtualRangeWithinTheStops) {
  SetSliderSends(true);
  const auto expect = [&](PulsePair range, PulsePair stops, int slider, int pushed,
                          const std::vector<int>& sent) {
    SCOPED_TRACE(slider);
    sent_.clear();
    choice_.values.VirtualRange = range;
    choice_.values.VirtualStops = stops;
    const int updates = pictures_.updates;
    MoveSliderTo(slider);
    Settle();
    EXPECT_EQ(view_.slider, pushed);
    EXPECT_EQ(pictures_.updates, updates + 1);
    EXPECT_EQ(pictures_.updated_to, view_.read_out.pulse_width);
    EXPECT_EQ(SentPositions(), sent);
  };
  const auto expect_read_out = [&](int percent, int dmx, Microseconds pulse_width) {
    EXPECT_EQ(view_.read_out.percent, percent);
    EXPECT_EQ(view_.read_out.dmx, dmx);
    EXPECT_EQ(view_.read_out.pulse_width, pulse_width);
  };
  expect({1000, 2000}, {10, 2550}, 1000, 1000, {200});
  expect_read_out(100, 255, 2000);
  expect({1000, 2000}, {10, 2550}, 515, 515, {152});
  expect_read_out(52, 131, 1515);  // 51.5, 131.325, 151.5
  expect({1000, 2000}, {10, 2550}, 525, 525, {152});
  expect_read_out(52, 134, 1525);  // 52.5, 133.875, 152.5
  expect({1001, 1004}, {10, 2550}, 500, 500, {100});
  expect_read_out(50, 128, 1003);  // 127.5, 1001 + 1.5

  expect({1000, 2000}, {1200, 1800}, 100, 200, {120});
  expect({1000, 2000}, {1200, 1790}, 1000, 790, {179});
  // 1205 would go out as 1200, and 1795 as 1800.
  expect({1000, 2000}, {1205, 1795}, 205, 206, {121});
  expect({1000, 2000}, {1205, 1795}, 1000, 794, {179});
  expect({1000, 1100}, {1050, 1100}, 0, 495, {105});  // 49.5 rounds to 50: several positions have one width
  // Nowhere to go: the stops lie beyond the range, are crossed over, or between two positions.
  expect({1000, 2000}, {2100, 2200}, 500, 500, {});
  expect({1000, 2000}, {1600, 1400}, 500, 500, {});
  expect({500, 2500}, {1501, 1501}, 500, 500, {});
  // The range is crossed over: up is away from the stops.
  expect({2000, 1000}, {1200, 1800}, 900, 900, {});
  expect({2000, 1000}, {1200, 1800}, 700, 700, {130});
}

TEST_F(Live, WaitingPosition_GoesOutUnlessItsRecordsOrItsPortAreGone) {
  SetSliderSends(true);

  // Another channel, another unit: their positions take no other servo's place.
  Drag();
  choice_.channel = 5;
  MoveSliderTo(430);
  target_.unit = 0x0A;
  MoveSliderTo(440);
  Settle();
  std::vector<std::tuple<int, int, int>> sent;
  for (const LiveCommand& command : sent_) sent.emplace_back(command.unit, command.mask, command.position);
  EXPECT_THAT(sent, ElementsAre(std::tuple(1, 4, 140), std::tuple(1, 4, 142), std::tuple(1, 32, 143),
                                std::tuple(10, 32, 144)));

  // A test button, and a unit command.
  Drag();
  SetSliderSends(false);
  test_.OnTestButton(4);
  Settle();
  EXPECT_THAT(SentPositions(), ElementsAre(140, 142, 150));
  SetSliderSends(true);
  Drag();
  world_.Attach("", 0x0A);
  const std::size_t logged = world_.log.lines.size();
  commands_.get.Start();
  EXPECT_EQ(world_.log.lines.size(), logged + 1) << "at once, before the command's own";
  RunToTheEnd();
  EXPECT_THAT(SentPositions(), ElementsAre(140, 142));

  // Other records have other stops.
  Drag();
  test_.OnRecordsReplaced();
  Settle();
  EXPECT_THAT(SentPositions(), ElementsAre(140));

  // The port is not opened for it.
  Drag();
  link_.SetPortOpen(false);
  world_.time.Advance(1000);
  EXPECT_FALSE(link_.PortOpen());
  EXPECT_EQ(world_.time.RunningTimers(), 1) << "that of the progress display";
}

TEST_F(Live, UnitCommand_StopsASweepAndHasTheLineToItself) {
  auto& unit = world_.Attach("", 0x01);
  test_.OnTestButton(0);
  world_.time.Advance(500);
  sent_.clear();
  target_.port_chosen = false;
  commands_.send.Start();  // refused: the sweep goes on
  world_.boxes.Take();
  EXPECT_TRUE(view_.captions[0]);
  target_.port_chosen = true;

  commands_.send.Start();
  EXPECT_THAT(view_.captions, testing::Each(false));
  EXPECT_EQ(test_.ShownPosition(), 1500);
  SetSliderSends(true);
  while (commands_.running.Active()) {
    MoveSliderTo(100 + static_cast<int>(world_.time.ElapsedMs() % 800));
    world_.time.Advance(7);
  }
  ExpectSuccess("SUCCESS: Send Complete!");
  EXPECT_EQ(unit.accepted_commands(), 5u + 8u);
  MoveSliderTo(300);
  Settle();
  EXPECT_THAT(SentPositions(), ElementsAre(150, 130));
}

TEST_F(Live, Faults_StopEverythingAndAreShownOnce) {
  // From the start: the port cannot be opened.
  const auto expect_one_box = [&](const std::function<void()>& act) {
    world_.bench.Unplug(1);
    act();
    world_.time.Advance(3000);
    EXPECT_THAT(world_.boxes.Take(),
                ElementsAre(Fault("Comm Error!", "Open of serial port 1 has failed\r\n")));
    EXPECT_THAT(view_.captions, testing::Each(false));
    EXPECT_FALSE(view_.sends);
    world_.bench.Replug(1);
  };
  expect_one_box([&] { test_.OnTestButton(0); });
  expect_one_box([&] { test_.OnTestButton(4); });
  expect_one_box([&] {
    SetSliderSends(true);
    for (int value = 300; value < 400; ++value) MoveSliderTo(value);
  });

  // At a step, at a position that waits, and when either makes way for a command, which then does not start: the
  // timers have stopped before the box opens.
  auto& unit = world_.Attach("", 0x01);
  world_.boxes.while_open = [&] {
    world_.time.Advance(2000);
    EXPECT_EQ(world_.time.RunningTimers(), 0);
  };
  for (const bool command : {false, true}) {
    for (const bool sweep : {false, true}) {
      if (sweep) {
        test_.OnTestButton(0);
        world_.time.Advance(300);
      } else {
        SetSliderSends(true);
        Drag();
      }
      world_.log.broken = true;
      if (command) commands_.get.Start();
      world_.time.Advance(1000);
      EXPECT_THAT(world_.boxes.Take(), ElementsAre(testing::Field(&BoxMessage::title, "Comm Error!")));
      EXPECT_THAT(view_.captions, testing::Each(false));
      EXPECT_FALSE(commands_.running.Active());
      world_.log.broken = false;
    }
  }
  EXPECT_EQ(unit.polls_heard(), 0u);

  // A position that no unit knows never becomes a byte.
  sent_.clear();
  for (const Microseconds position : {4, -20, 2556, 70000}) {
    choice_.values.DefaultPosition = position;
    test_.OnTestButton(2);
    EXPECT_EQ(world_.boxes.Take().size(), 1u) << position;
  }
  Settle();
  EXPECT_THAT(sent_, IsEmpty());
}

}  // namespace
}  // namespace tendril::test
