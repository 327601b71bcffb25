// find, set-id, monitor and --trace.
#include <csignal>
#include <vector>

#include "ctl/ctl_fixture.h"
#include "support/recording_device.h"

namespace tendril::test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

class LineCommands : public CtlTest {
 protected:
  // Each unit as it behaves, and its ID.
  using Units = std::vector<std::pair<const char*, std::uint8_t>>;

  void AttachAll(const Units& units) {
    for (VirtualUnit* unit : std::exchange(units_, {})) world_.bench.Detach(1, *unit);
    for (const auto& [fault, id] : units) units_.push_back(&world_.Attach(fault, id));
  }
  std::vector<VirtualUnit*> units_;
};

TEST_F(LineCommands, Find_ListsWhatAnswersAndTheTraceShowsIt) {
  AttachAll({{"", 0x02}, {"", 0x03}, {"", 0x03}});
  EXPECT_EQ(Run("find 02 --trace --quiet"), 0);
  EXPECT_EQ(terminal_.out, "02 answers\n1 unit found: 02.\n");
  EXPECT_THAT(terminal_.error,
              HasSubstr("  program  00 02 88 2A 2D 00         echo: poll unit 02, kind '*'\n"));
  EXPECT_EQ(Run("find 01-05 --json"), 1);
  EXPECT_THAT(terminal_.out, HasSubstr("\"answer\": \"perhapsSeveral\",\n            \"unit\": \"03\""));
  EXPECT_EQ(Run("find 04-05 --quiet"), 1);
  EXPECT_EQ(terminal_.error,
            "tendril-ctl: No unit answered. Check power, wiring and port. Other IDs are not searched.\n");
}

TEST_F(LineCommands, SetId_WritesOnlyToOneUnitAlone) {
  struct Case {
    Units units;
    std::string arguments;
    int exit_code;
    const char* changed;
    const char* said;
    const char* answer = nullptr;  // null: no terminal
  };
  const char* const kYes = "\"changed\": \"yes\"";
  const char* const kNo = "\"changed\": \"no\"";
  const char* const kUnclean = "Each poll of FF must bring one clean reply";
  const Case cases[] = {
      {{{"", 0xFF}}, "", 2, "", "without a terminal, --yes is needed"},
      {{{"", 0xFF}}, " --yes", 0, kYes, ""},
      {{{"", 0xFF}}, "", 0, kYes, "Give the unit on Comm 1 the ID 0B? [y/N] ", "y"},
      {{{"", 0xFF}}, "", 1, kNo, "Not confirmed. No ID has changed.", ""},
      {{{"", 0x01}}, " --yes", 1, kNo, "1 unit found: 01. Every unit that is connected would take the ID"},
      {{{"late", 0x01}}, " --yes", 1, kNo, "too late: 01. Every unit"},
      {{{"", 0x01}}, " --alone", 0, kYes, "Give the unit on Comm 1, now 01, the ID 0B? [y/N] ", "Y"},
      {{{"", 0x0B}}, " --alone --yes", 0, kNo, ""},
      {{{"", 0xFF}, {"", 0xFF}}, " --yes", 1, kNo, kUnclean},
      {{{"", 0xFF}, {"", 0x01}}, " --alone --yes", 1, kNo, kUnclean},
      {{{"", 0xFF}, {"late", 0xFF}}, " --alone --yes", 1, kNo, kUnclean},
      {{{"rambling", 0xFF}}, " --alone --yes", 1, kNo, kUnclean},
      {{{"deaf", 0xFF}}, " --alone --yes", 1, kNo, kUnclean},
      {{}, " --alone --yes", 1, kNo, "No unit answered. Check power, wiring and port. No ID has changed."},
      {{{"stubborn", 0x07}}, " --alone --yes", 1, kNo, "The unit is still at 07: it has not taken the ID."}};
  for (const Case& each : cases) {
    AttachAll(each.units);
    if (each.answer != nullptr) terminal_.answer = QString::fromUtf8(each.answer);
    const int exit_code = Run("set-id 0B --json --quiet" + each.arguments);
    terminal_.answer.reset();
    SCOPED_TRACE(each.said);
    EXPECT_EQ(exit_code, each.exit_code);
    EXPECT_THAT(terminal_.out, HasSubstr(each.changed));
    EXPECT_THAT(terminal_.error, HasSubstr(each.said));
    for (std::size_t i = 0; i < units_.size(); ++i) {
      EXPECT_EQ(units_[i]->id(), each.changed == kYes ? 0x0B : each.units[i].second);
      EXPECT_EQ(units_[i]->polls_heard() == 0, exit_code == 2);
    }
  }
}

// Answers each poll as if it asked for the options of a port.
class OtherAnswerUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  Transmission Reply(std::uint8_t /*kind*/, const Bytes& data, std::uint64_t poll_end_us) override {
    return VirtualUnit::Reply('n', data, poll_end_us);
  }
};

TEST_F(LineCommands, SetId_WritesOnlyToTheUnitThatAnswersAndWasAskedAbout) {
  VirtualUnit& other = world_.bench.Attach<OtherAnswerUnit>(1, std::uint8_t{0xFF});
  EXPECT_EQ(Run("set-id 0B --alone --yes --quiet"), 1);
  EXPECT_THAT(terminal_.error, HasSubstr("Each poll of FF must bring one clean reply"));
  EXPECT_EQ(other.id(), 0xFF);
  world_.bench.Detach(1, other);
  AttachAll({{"", 0x01}});
  terminal_.answer = QStringLiteral("y");
  terminal_.asked = [this] { AttachAll({{"", 0x07}}); };
  EXPECT_EQ(Run("set-id 0B --alone --quiet"), 1);
  EXPECT_THAT(terminal_.error, HasSubstr("Unit 07 answers now, and the question was about unit 01: start "
                                         "again. No ID has changed."));
  EXPECT_EQ(units_[0]->id(), 0x07);
}

// In the search, and after the ID was sent.
TEST_F(LineCommands, SetIdThatIsStopped_SaysHowTheUnitIsLeft) {
  for (const auto& [option, after_ms, said] :
       {std::tuple("--json", 500,
                   "Stopped. Only IDs up to 05 were polled. No unit answered. No ID has changed."),
        {"--alone", 1000, "Stopped. The unit may be at 0B already."}}) {
    AttachAll({{"restarting", 0xFF}});
    stop_ = {};
    In(after_ms, [this] { stop_.Make(SIGINT); });
    EXPECT_EQ(Run(std::string("set-id 0B --yes --quiet ") + option), 130);
    EXPECT_EQ(terminal_.error, std::string("tendril-ctl: ") + said + "\n");
  }
  AttachAll({{"restarting", 0xFF}});
  stop_ = {};
  In(1000, [this] { world_.bench.Unplug(1); });
  EXPECT_EQ(Run("set-id 0B --yes --alone --quiet"), 1);
  EXPECT_THAT(terminal_.error,
              HasSubstr(" again. The unit may be at 0B already. Run set-id again, or find.\n"));
}

TEST_F(LineCommands, Monitor_ReadsAndNeverSends) {
  RecordingDevice device;
  ctl::Environment environment{device,       world_.time,     world_.time,        world_.log,
                               panel_.wsCLI, panel_.registry, panel_.processes,   *this,
                               stop_,        terminal_,       environment_.now_ms};
  std::vector<Bytes> arriving = {
      {0x00, 0x05, 0x88, 0x2A, 0x2D, 0x00}, {0x00, 0x00, 0xFE}, {0x2A, 0x05, 0x00, 0x12}, {0x34}};
  const auto timer = world_.time.CreateTimer([&, next = std::size_t{0}]() mutable {
    if (next < arriving.size()) return device.Receive(arriving[next++]);
    if (next++ > arriving.size() + 2) device.Raise(SerialEvent::kDeviceLost);
  });
  timer->SetInterval(50);
  timer->SetEnabled(true);
  ctl::CommandLine command;
  command.command = ctl::Command::kMonitor;
  command.port = 1;
  EXPECT_EQ(ctl::RunCommand(command, environment), 1);
  for (const char* packet : {"  program  00 05 88 2A 2D 00         poll unit 05, kind '*'\n",
                             "  unit     00 00 FE 2A 05 00         reply to '*': here is unit 05\n",
                             "           12 34                     ⚠ noise\n"})
    EXPECT_THAT(terminal_.out, HasSubstr(packet));
  EXPECT_EQ(
      terminal_.error,
      "Listening on Comm 1; Ctrl+C ends it.\ntendril-ctl: The port went away: plug the adapter in again.\n");
  EXPECT_THAT(device.actions, ElementsAre("open 1 at 19200", "rts off", "close"));
  EXPECT_THAT(device.writes, ElementsAre());
}

}  // namespace
}  // namespace tendril::test
