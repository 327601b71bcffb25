// find, set-id, monitor and --trace.
#include <QJsonArray>
#include <QJsonDocument>
#include <csignal>
#include <regex>
#include <vector>

#include "ctl/ctl_fixture.h"
#include "platform/hex_text.h"
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
    for (const auto& [fault, id] : units) units_.push_back(&Attach(fault, id));
  }
  // A member of the document that was printed.
  std::string Member(const char* name) const {
    const QJsonValue value =
        QJsonDocument::fromJson(QByteArray::fromStdString(terminal_.out))[QLatin1StringView(name)];
    std::string text = value.toString().toStdString();
    for (const QJsonValue& unit : value.toArray())
      text += (unit[u"unit"].toString() + u' ' + unit[u"answer"].toString() + u' ').toStdString();
    return text;
  }
  // Lines of the trace without their times.
  static std::string Timeless(const std::string& lines) {
    return std::regex_replace(lines, std::regex("(^|\n)[0-9:.]{12}  "), "$1");
  }

  std::vector<VirtualUnit*> units_;
};

TEST_F(LineCommands, Find_ListsWhatAnswers) {
  struct Case {
    Units units;
    const char* found;
    const char* sentence;
    int exit_code;
  };
  const Case cases[] = {
      {{{"", 0x02}, {"", 0x05}}, "02 clean 05 clean ", "2 units found: 02 and 05.", 0},
      {{{"", 0x02}, {"", 0x03}, {"", 0x03}},
       "02 clean 03 perhaps several ",
       "1 unit found: 02; perhaps several at 03.",
       1},
      {{{"late", 0x02}}, "02 late ", "No unit answered; too late: 02.", 1},
      {{{"wrong-address", 0x02}}, "02 other ", "No unit answered; an answer to something else at 02.", 1},
      {{{"", 0x06}}, "", "No unit answered. Check power, wiring and port. Other IDs are not searched.", 1}};
  for (const Case& each : cases) {
    AttachAll(each.units);
    EXPECT_EQ(Run("find 01-05 --json"), each.exit_code);
    EXPECT_EQ(Member("found"), each.found);
    EXPECT_THAT(Member("sentence"), testing::StartsWith(each.sentence));
  }
  EXPECT_EQ(Run("find 06"), 0);
  EXPECT_EQ(terminal_.out, "06 answers\n1 unit found: 06.\n");
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
  const std::string unclean = "Each poll of FF must bring one clean reply";
  const Case cases[] = {
      {{{"", 0xFF}}, "", 2, "", "without a terminal, --yes is needed"},
      {{{"", 0xFF}}, " --yes", 0, "yes", ""},
      {{{"", 0xFF}}, "", 0, "yes", "Give the unit on Comm 1 the ID 0B? [y/N] ", "y"},
      {{{"", 0xFF}}, "", 1, "no", "Not confirmed. No ID has changed.", ""},
      {{{"", 0x01}}, " --yes", 1, "no", "1 unit found: 01. Every unit that is connected would take the ID"},
      {{{"late", 0x01}}, " --yes", 1, "no", "too late: 01. Every unit"},
      {{{"", 0x01}}, " --alone", 0, "yes", "Give the unit on Comm 1, now 01, the ID 0B? [y/N] ", "Y"},
      {{{"", 0x0B}}, " --alone --yes", 0, "no", ""},
      {{{"", 0xFF}, {"", 0xFF}}, " --yes", 1, "no", unclean.c_str()},
      {{{"", 0xFF}, {"", 0x01}}, " --alone --yes", 1, "no", unclean.c_str()},
      {{{"", 0xFF}, {"late", 0xFF}}, " --alone --yes", 1, "no", unclean.c_str()},
      {{{"rambling", 0xFF}}, " --alone --yes", 1, "no", unclean.c_str()},
      {{{"deaf", 0xFF}}, " --alone --yes", 1, "no", unclean.c_str()},
      {{}, " --alone --yes", 1, "no", "No unit answered. Check power, wiring and port. No ID has changed."},
      {{{"stubborn", 0xFF}}, " --alone --yes", 1, "perhaps", "The unit may be at 0B already."}};
  for (const Case& each : cases) {
    AttachAll(each.units);
    if (each.answer != nullptr) terminal_.answer = QString::fromUtf8(each.answer);
    const int exit_code = Run("set-id 0B --json --quiet" + each.arguments);
    terminal_.answer.reset();
    SCOPED_TRACE(each.said);
    EXPECT_EQ(exit_code, each.exit_code);
    EXPECT_EQ(Member("changed"), each.changed);
    EXPECT_THAT(terminal_.error, HasSubstr(each.said));
    for (std::size_t i = 0; i < units_.size(); ++i) {
      EXPECT_EQ(units_[i]->id(), each.changed == std::string("yes") ? 0x0B : each.units[i].second);
      EXPECT_EQ(units_[i]->polls_heard() == 0, exit_code == 2);
    }
  }
}

// In the search, and after the ID was sent.
TEST_F(LineCommands, SetIdThatIsStopped_SaysHowTheUnitIsLeft) {
  const auto timer = world_.time.CreateTimer([this] { stop_.Make(SIGINT); });
  for (const auto& [option, after_ms, said] :
       {std::tuple("--json", 500,
                   "Stopped. Only IDs up to 05 were polled. No unit answered. No ID has changed."),
        {"--alone", 1000, "Stopped. The unit may be at 0B already."}}) {
    AttachAll({{"restarting", 0xFF}});
    stop_ = {};
    timer->SetInterval(after_ms);
    timer->SetEnabled(true);
    EXPECT_EQ(Run(std::string("set-id 0B --yes --quiet ") + option), 130);
    EXPECT_EQ(terminal_.error, std::string("tendril-ctl: ") + said + "\n");
  }
}

// The line is released before the echo is printed.
TEST_F(LineCommands, Trace_ShowsEachPacket) {
  Attach("", 0x05);
  EXPECT_EQ(Run("find 05 --trace --quiet"), 0);
  EXPECT_EQ(Timeless(terminal_.error),
            "                                   Comm 1 at 19200 bit/s is open\n"
            "                                   RTS on: the program has the line\n"
            "                                   RTS on: the program has the line\n"
            "program  00 05 88 2A 2D 00         poll unit 05, kind '*'\n"
            "program  00 05 88 2A 2D 00         echo: poll unit 05, kind '*'\n"
            "                                   RTS off: the line is free for the reply\n"
            "unit     00 00 00 FE 2A 05 00      reply to '*': here is unit 05\n"
            "                                   RTS on: the program has the line\n"
            "program  00 00                     2 zero bytes\n"
            "                                   the port is closed\n");
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
  ctl::CommandLine line;
  line.command = ctl::Command::kMonitor;
  line.port = 1;
  EXPECT_EQ(ctl::RunCommand(line, environment), 1);
  EXPECT_EQ(Timeless(terminal_.out),
            "program  00 05 88 2A 2D 00         poll unit 05, kind '*'\n"
            "unit     00 00 FE 2A 05 00         reply to '*': here is unit 05\n"
            "         12 34                     ⚠ noise\n");
  EXPECT_EQ(terminal_.error, "Listening on Comm 1; Ctrl+C ends it.\ntendril-ctl: The port went away.\n");
  EXPECT_THAT(device.actions, ElementsAre("open 1 at 19200", "rts off", "close"));
  EXPECT_THAT(device.writes, ElementsAre());
}

}  // namespace
}  // namespace tendril::test
