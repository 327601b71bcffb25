// Finding units: every ID is polled once, and what answers is listed.
#include "command_fixture.h"

namespace tendril::test {
namespace {

using testing::HasSubstr;

class Find : public CommandTest {
 protected:
  // "01 answers, 20 perhaps several units".
  std::string Found() const {
    std::string text;
    for (const FoundUnit& unit : commands_.find.Search().found)
      text += (text.empty() ? "" : ", ") + HexByte(unit.id) + " " + unit.Words();
    return text;
  }
  std::size_t Polls() const { return noted_.size() / 4; }  // "01+ "
};

// The floor: a poll and its reply on the wire, with the unit's turn-round, or the time-out while the poll's six bytes
// wait: 20 bits at 19200 for each of them, 38, and the 45 pads.
TEST_F(Find, TakesNoLongerThanBytesAndTimeOuts) {
  target_.unit = 0x33;
  for (const int id : {0x01, 0x0A, 0x7F, 0x20, 0x20}) Attach("", static_cast<std::uint8_t>(id));
  const std::uint64_t start_ms = world_.time.ElapsedMs();
  commands_.find.Start();
  world_.time.Advance(1100);
  EXPECT_EQ(progress_.title, "Finding units: 12 of 253, 2 found");
  ASSERT_TRUE(world_.time.AdvanceUntil([&] { return !commands_.running.Active(); }, 60'000));
  constexpr double kTimeOutMs = (6 + 38 + 45) * 20 * 1000.0 / 19200;
  constexpr double kReplyMs = (6 + 3 + 4) * 10 * 1000.0 / 19200 + 2;
  const double ratio =
      static_cast<double>(world_.time.ElapsedMs() - start_ms) / (251 * kTimeOutMs + 3 * kReplyMs);
  EXPECT_GT(ratio, 0.98);
  EXPECT_LE(ratio, 1.02);
  std::string polls;
  for (int id = 1; id <= 0xFD; ++id)
    polls += HexByte(static_cast<std::uint8_t>(id)) + (id == 1 || id == 10 || id == 0x7F ? "+ "
                                                       : id == 0x20                      ? "- 20- "
                                                                                         : "- ");
  EXPECT_EQ(noted_, polls);
  EXPECT_EQ(Found(), "01 answers, 0A answers, 20 perhaps several units, 7F answers");
  EXPECT_EQ(said_,
            "Finding units at 14:05: Search complete. 3 units found: 01, 0A and 7F; perhaps several at 20. "
            "Connect units that share an ID one at a time, and give each its own.");
  ExpectSuccess("Search complete");
}

TEST_F(Find, EndsBeforeTheLastId) {
  struct Case {
    const char* why;
    std::function<void()> act;
    std::vector<std::string> boxes;
    const char* said;
  };
  Attach("", 0x01);
  for (const Case& c :
       {Case{"cancelled", [&] { commands_.Cancel(); }, {}, "Cancelled: COMMAND FAILED! Only IDs up to 0D"},
        {"unplugged",
         [&] {
           world_.bench.Unplug(1);
           world_.time.Advance(5);
           world_.bench.Replug(1);  // at once: the search goes on at no other device
         },
         {"Comm Error!"},
         "COMMAND FAILED! Only IDs up to 0C"}}) {
    noted_.clear();
    commands_.find.Start();
    world_.time.Advance(1200);
    const std::size_t polls = Polls();
    c.act();
    world_.time.Advance(200);
    EXPECT_FALSE(commands_.running.Active()) << c.why;
    EXPECT_EQ(Polls(), polls + 1) << c.why << ": nothing follows the poll that is out";
    EXPECT_EQ(said_, "Finding units at 14:05: " + std::string(c.said) + " were polled. 1 unit found: 01.");
    std::vector<std::string> titles;
    for (const BoxMessage& box : world_.boxes.Take()) titles.push_back(box.title);
    EXPECT_EQ(titles, c.boxes) << c.why;
  }
}

TEST_F(Find, BytesThatComeOnlyOnce_AreNoSharedId) {
  Attach("", 0x01);
  VirtualUnit& other = Attach("", 0x01);
  commands_.find.Start();
  ASSERT_TRUE(world_.time.AdvanceUntil([&] { return noted_ == "01- "; }, 500));
  world_.bench.Detach(1, other);
  world_.time.Advance(50);
  EXPECT_EQ(Found(), "01 answers");
}

// What the replies of badly behaved units, and bytes that make no reply, are taken for.
TEST_F(Find, SaysWhatIsAtAnId) {
  struct Case {
    const char* fault;
    const char* found;
  };
  for (const Case& c :
       {Case{"mute", ""}, {"rambling", "02 answers"}, {"deaf", "02 answers"}, {"late", "03 answers as 02"}}) {
    VirtualUnit& unit = Attach(c.fault, 0x02);
    commands_.find.Start();
    world_.time.Advance(600);
    EXPECT_EQ(Found(), c.found) << c.fault;
    commands_.Cancel();
    world_.time.Advance(200);
    world_.bench.Detach(1, unit);
  }
}

// A damaged echo is no sign of units.
TEST_F(Find, SaysWhatToDoWhenNoUnitAnswers) {
  struct Case {
    VirtualLineOptions options;
    const char* said;
  };
  for (const Case& c : {Case{{}, "Check power, wiring and port. A unit fresh from the factory has FF"},
                        {{.echo = false}, "Nothing comes back"},
                        {{.echo_loses_every = 5}, "What the program sends comes back damaged"}}) {
    VirtualPorts bench{world_.time, world_.time};
    bench.AddPort(1, c.options);
    const auto device = bench.CreateDevice();
    HwSerial link{*device, world_.time, world_.time, world_.log};
    link.SetCommPort(1);
    link.SetBaudRate(19200);
    link.SetLineObserver([this](const LineEvent& event) { trace_.Note(event, 0); });
    UnitCommands commands{link, trace_, world_.time, world_.boxes, progress_, target_, working_, events_};
    commands.find.Start();
    world_.time.Advance(25'000);
    EXPECT_THAT(commands.find.Search().Sentence(),
                testing::StartsWith(std::string("No unit answered. ") + c.said));
  }
}

TEST(UnitSearch, ManySharedIds_AreNoise) {
  UnitSearch search{.polled = UnitSearch::kIds, .found = {}};
  for (std::uint8_t id = 1; id <= 30; ++id)
    search.found.push_back({id, FoundUnit::What::kPerhapsSeveral, id});
  EXPECT_THAT(search.Sentence(),
              HasSubstr("at 01, 02, 03, 04, 05, 06, 07, 08, 09, 0A, 0B, 0C and 18 more. So many"));
}

}  // namespace
}  // namespace tendril::test
