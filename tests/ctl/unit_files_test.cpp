// The commands that take configurations from units to files and back.
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <algorithm>
#include <csignal>
#include <map>
#include <string>

#include "config/option_bytes.h"
#include "ctl/ctl_fixture.h"

namespace tendril::test {
namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::StartsWith;

// A port after a send of wide.json.
constexpr PortOptionBytes kWide{1, 50, 250, 70, 230, 70, 230, 150, 150};

// In a folder with wide.json, whose values no unit has yet.
class UnitFiles : public CtlTest {
 protected:
  UnitFiles() {
    QDir::setCurrent(folder_.path());
    EXPECT_EQ(Run("preset wide --output wide.json"), 0);
  }
  void AttachUnits(std::uint8_t first, std::uint8_t last) {
    for (std::uint8_t id = first; id <= last; ++id) world_.Attach("", id);
  }
  // "unit-05.json unit-06.json".
  static std::string FilesIn(const char* folder) {
    return QDir(QString::fromUtf8(folder)).entryList(QDir::Files | QDir::Hidden).join(u' ').toStdString();
  }
  static QByteArray TextOf(const char* path) {
    QFile file(QString::fromUtf8(path));
    EXPECT_TRUE(file.open(QIODevice::ReadOnly)) << path;
    return file.readAll();
  }
  static void Write(const char* path, const QByteArray& text) {
    QFile file(QString::fromUtf8(path));
    EXPECT_TRUE(file.open(QIODevice::WriteOnly) && file.write(text) == text.size()) << path;
  }
  // Writes wide.json with `after` in place of `before`.
  static void Edit(const char* path, const char* before, const char* after) {
    QDir().mkpath(QFileInfo(QString::fromUtf8(path)).path());
    Write(path, TextOf("wide.json").replace(before, after));
  }
  static bool Untouched(const VirtualUnit& unit) {
    return unit.polls_heard() + unit.accepted_commands() == 0;
  }
};

TEST_F(UnitFiles, Send_GoesOnAfterAUnitThatFails) {
  const std::map<std::string, std::string> rows{
      {"mute", "05    no       -         Unit 05 does not answer: check its power, its ID and the wiring.\n"},
      {"locked",
       "05    perhaps  -         Unit 05 answers, but has not accepted what was sent.\n"
       "                         Send again; if that fails, too, the unit or the line is faulty.\n"
       "                         Port 1 is perhaps written, 2 to 8 are not.\n"},
      {"short-reply",
       "05    partly   -         Unit 05 answers, but does not acknowledge what was sent.\n"
       "                         Send again; if that fails, too, it is faulty.\n"
       "                         It holds half a configuration: port 1 is written, 2 perhaps, 3 to 8 "
       "are not.\n"},
      {"missing-port",
       "05    yes      -         Unit 05 answers, but does not report all of its eight ports.\n"
       "                         Read it again; if that fails, too, it is faulty.\n"}};
  world_.Attach("", 0x06);
  const std::string headings = "unit  written  compared\n";
  for (const auto& [fault, row] : rows) {
    VirtualUnit& unit = world_.Attach(fault, 0x05);
    EXPECT_EQ(Run("send wide.json 05,06"), 1);
    EXPECT_EQ(terminal_.out, headings + row + "06    yes      equal\n");
    EXPECT_THAT(terminal_.error, EndsWith("unit 06 (2 of 2): written, holds it\n"
                                          "tendril-ctl: 1 of 2 units failed. For another run: 05.\n"));
    world_.bench.Detach(1, unit);
  }
  const VirtualUnit& deaf = world_.Attach("deaf", 0x05);
  EXPECT_EQ(Run("send wide.json 05 --quiet --no-compare"), 0);
  EXPECT_EQ(terminal_.out, headings + "05    yes      -\n");
  EXPECT_EQ(terminal_.error, "");
  EXPECT_EQ(deaf.PortOptions(8), kWide);
}

TEST_F(UnitFiles, Compare_SaysWhatDiffers) {
  VirtualUnit& forgetful = world_.Attach("", 0x05);
  In(2000, [&] { forgetful.SetPortOptions(3, {1, 50, 250, 70, 230, 70, 230, 151, 150}); });
  EXPECT_EQ(Run("send wide.json 05 --json"), 1);
  const auto json = QString::fromStdString(terminal_.out).simplified().toStdString();
  EXPECT_THAT(json, HasSubstr(R"("units": [ { "compared": "differs", "differences": [ { "held": "1510", )"
                              R"("part": "defaultPosition", "ports": [ 3 ], "wanted": "1500" } ], )"
                              R"("outcome": "differs", "unit": "05", "written": "all" } ])"));
  VirtualUnit& other = world_.Attach("", 0x06);
  for (const int port : {1, 2, 3, 5, 7, 8}) other.SetPortOptions(port, kWide);
  EXPECT_EQ(Run("compare wide.json 05,06,07"), 1);
  EXPECT_THAT(
      terminal_.out,
      StartsWith(
          "unit  compared\n"
          "05    differs   port 3, default position: 1500 in the file, 1510 in the unit\n"
          "06    differs   ports 4, 6, actual range: 500 to 2500 in the file, 600 to 2400 in the unit\n"));
  EXPECT_THAT(terminal_.error,
              HasSubstr("tendril-ctl: 2 of 3 units differ, 1 failed. For another run: 05-07.\n"));

  Edit("same.json", "[500, 2500]", "[509, 2501]");
  EXPECT_EQ(Run("compare wide.json same.json"), 0);
  Edit("other.json", "stop pulse", "hold");
  EXPECT_EQ(Run("compare wide.json other.json"), 1);
  EXPECT_EQ(terminal_.out,
            "ports  part                 wide.json                            other.json\n"
            "1-8    lost communications  Stop Pulse / Start on First Command  Hold at Current Position\n");
}

TEST_F(UnitFiles, Stop_NamesTheUnitThatHoldsHalfAConfiguration) {
  world_.Attach("", 0x05);
  VirtualUnit& unit = world_.Attach("", 0x06);
  VirtualUnit& last = world_.Attach("", 0x07);
  In(4000, [this] { stop_.Make(SIGINT); });
  EXPECT_EQ(Run("send wide.json 05-07 --quiet"), 130);
  EXPECT_EQ(terminal_.out,
            "unit  written  compared\n"
            "05    yes      equal\n"
            "06    partly   -         Stopped. It holds half a configuration: ports 1 to 5 are written, 6 to "
            "8 are not.\n"
            "07    no       -         Not tried.\n");
  EXPECT_EQ(
      terminal_.error,
      "tendril-ctl: Stopped at unit 06. It holds half a configuration: ports 1 to 5 are written, 6 to 8 are "
      "not. 1 of 3 units was not tried. For another run: 06-07.\n");
  EXPECT_EQ(unit.accepted_commands(), 5U);
  EXPECT_TRUE(Untouched(last));
}

TEST_F(UnitFiles, Backup_WritesWholeFilesAndReplacesNone) {
  AttachUnits(0x05, 0x07);
  In(100, [] { Write("other.json", "by another program"); });
  EXPECT_EQ(Run("get 05 --output other.json --quiet"), 1);
  EXPECT_EQ(terminal_.out, "unit  file\n05    -     other.json exists already; --force overwrites it.\n");
  EXPECT_EQ(TextOf("other.json"), "by another program");
  In(200, [this] { stop_.Make(SIGINT); });
  EXPECT_EQ(Run("backup kept 05-07 --quiet"), 130);
  EXPECT_EQ(FilesIn("kept"), "unit-05.json");
  EXPECT_THAT(terminal_.out, HasSubstr("06    -                  Stopped.\n"));
}

TEST_F(UnitFiles, BackupAndRestore_GiveEachUnitBackWhatItHeld) {
  std::vector<VirtualUnit*> units;
  for (std::uint8_t id = 0x05; id <= 0x06; ++id) {
    units.push_back(&world_.Attach("", id));
    for (int port = 1; port <= kUnitPorts; ++port)
      units.back()->SetPortOptions(port, {0x9E, 255, 1, id, 7, 8, 9, 10, static_cast<std::uint8_t>(port)});
  }
  world_.Attach("garbling", 0x09);
  EXPECT_EQ(Run("backup kept"), 1);
  EXPECT_EQ(terminal_.out,
            "unit  file\n05    kept/unit-05.json\n06    kept/unit-06.json\n"
            "09    -                  Not read: perhaps several units.\n");
  EXPECT_EQ(Run("get 05"), 0);
  EXPECT_THAT(terminal_.out, HasSubstr("\"unit\": \"05\",\n  \"read\": \"2026-11-"));
  EXPECT_EQ(Run("send wide.json 05,06 --quiet"), 0);
  EXPECT_EQ(Run("backup kept --quiet"), 2);  // without --force
  EXPECT_EQ(Run("restore kept --backup changed --quiet"), 0);
  for (std::uint8_t i = 0; i < 2; ++i)
    EXPECT_EQ(units[i]->PortOptions(4), (PortOptionBytes{0x9E, 255, 1, std::uint8_t(5 + i), 7, 8, 9, 10, 4}));
  EXPECT_EQ(Run("compare wide.json changed/unit-06.json"), 0);
}

TEST_F(UnitFiles, AUnitWithoutABackup_IsNotWritten) {
  VirtualUnit& exact = world_.Attach("", 0x05);
  VirtualUnit& inexact = world_.Attach("", 0x06);
  inexact.SetPortOptions(3, {0x41, 60, 240, 100, 200, 100, 200, 150, 150});
  VirtualUnit& empty = world_.Attach("", 0x07);
  empty.SetPortOptions(1, {4, 60, 240, 100, 200, 100, 200, 150, 150});
  EXPECT_EQ(Run("get 06"), 1);
  EXPECT_THAT(terminal_.out, HasSubstr("\"unit\": \"06\","));
  EXPECT_EQ(
      terminal_.error,
      "tendril-ctl: The configuration cannot have all: port 3, power up: Start Pulse on First Command in the "
      "file, unknown (flags 40) in the unit.\n");
  EXPECT_EQ(Run("send wide.json 05-07 --backup kept --quiet"), 1);
  EXPECT_EQ(exact.accepted_commands(), 8U);
  EXPECT_EQ(inexact.accepted_commands() + empty.accepted_commands(), 0U);
  const std::string gap(42, ' ');
  EXPECT_THAT(
      terminal_.out,
      HasSubstr(
          "06    no       -         kept/unit-06.json  Not written: a file cannot have all that the "
          "unit holds.\n" +
          gap +
          "  Port 3, power up: Start Pulse on First Command in the file, unknown (flags 40) in the unit.\n"));
  EXPECT_THAT(terminal_.out,
              HasSubstr("A file cannot have what the unit holds: port 1: output kind -1 cannot be sent."));
  EXPECT_EQ(FilesIn("kept"), "unit-05.json unit-06.json");
}

TEST_F(UnitFiles, ABadFile_IsRefusedBeforeAnythingIsSent) {
  VirtualUnit& unit = world_.Attach("", 0x05);
  Write("list.json", "hello");
  Edit("later.json", "\"version\": 1", "\"version\": 2");
  Edit("beyond.json", "\"neutralPosition\": 1500", "\"neutralPosition\": 2551");
  Edit("set/unit-05.json", "\"ports\"", "\"unit\": \"06\", \"ports\"");
  Edit("half/unit-05.json", "\"ports\"", "\"unit\": \"05\", \"ports\"");
  Write("half/unit-06.json", TextOf("wide.json").first(300));
  Edit("strange/unit-fe.json", "", "");
  QDir().mkdir(QStringLiteral("linked"));
  QFile::link(QStringLiteral("none.json"), QStringLiteral("linked/unit-05.json"));
  const QByteArray compact = TextOf("wide.json").simplified();
  Write("large.json",
        QByteArray(compact).insert(1, "\"note\": \"" + QByteArray(1'048'500 - compact.size(), 'x') + "\","));
#ifdef _WIN32
  const std::string no_such_file = "File not found.";
#else
  const std::string no_such_file = "No such file or directory.";
#endif
  using Case = std::pair<const char*, std::string>;
  for (const auto& [words, error] : {
           Case{"send none.json 05", "none.json cannot be read: " + no_such_file},
           Case{"send . 05", ". is a folder, not a file."},
           Case{"send list.json 05", "list.json: line 1: this is no configuration, which begins with {."},
           Case{"compare later.json 05", "later.json: version: 2 is not 1, the one known here."},
           Case{"compare wide.json beyond.json",
                "beyond.json: port 1, neutralPosition: 2551 is not a whole number from 10 to 2550."},
           Case{"restore none", "There is no folder none."},
           Case{"restore .", "The folder . has no backup: no file like unit-0A.json."},
           Case{"restore half", "half/unit-06.json: line 13: this is not JSON (unterminated string)."},
           Case{"restore half 05,07", "half/unit-07.json cannot be read: " + no_such_file},
           Case{"restore set",
                "set/unit-05.json: it was read from unit 06; --yes writes it into unit 05 all the same."},
           Case{"restore strange",
                "strange/unit-fe.json: a unit at FE cannot be reached through an adapter with an echo: IDs "
                "are 01 to FD."},
#ifdef __linux__
           Case{"restore linked", "linked/unit-05.json cannot be read: " + no_such_file},
           Case{"get 05 --output /dev/null --force", "/dev/null is not a regular file."},
#endif
           Case{"show large.json", "large.json: with a field a line, the text is larger than 1 MiB."},
           Case{"send ./half/unit-05.json 06,05 --backup half --force",
                "The backup half/unit-05.json would overwrite a file that this command reads: choose another "
                "folder."},
           Case{"send wide.json 05 --backup half",
                "half/unit-05.json exists already: give --backup another folder."},
           Case{"get 05 --output linked/unit-05.json",
                "linked/unit-05.json exists already; --force overwrites it."},
           Case{"get 05 --output wide.json", "wide.json exists already; --force overwrites it."},
           Case{"backup wide.json 05", "wide.json/unit-05.json cannot be written: "},
       }) {
    EXPECT_EQ(Run(words), 2) << words;
    EXPECT_THAT(terminal_.error, StartsWith("tendril-ctl: " + error)) << words;
  }
  EXPECT_TRUE(Untouched(unit));
  EXPECT_EQ(Run("restore set --yes --quiet"), 0);
  EXPECT_EQ(unit.accepted_commands(), 8U);
}

TEST_F(UnitFiles, FortyUnits_TakeWhatTheProtocolTakes) {
  constexpr int kUnits = 40;
  AttachUnits(1, kUnits);
  const std::uint64_t begin_ms = world_.time.ElapsedMs();
  EXPECT_EQ(Run("send wide.json 01-28 --quiet"), 0);
  const auto taken_ms = static_cast<double>(world_.time.ElapsedMs() - begin_ms);
  // For each port that is written: two packets, a poll, its reply and a pause. For each that is read: a poll and its
  // reply, which are 8 and 16 bytes long. A unit begins each reply after its turn-round.
  constexpr int kBytes = 5 + 16 + 6 + 8 + 6 + 16;
  const double turn_round_ms = static_cast<double>(ReplyTiming().turn_round_us) / 1000;
  const double floor_ms = kUnits * 8 * (kBytes * 10 * 1000 / 19200.0 + 300 + 2 * turn_round_ms);

  EXPECT_LE(taken_ms, 1.02 * floor_ms) << "floor " << floor_ms;
  EXPECT_GE(taken_ms, floor_ms);
}

TEST_F(UnitFiles, ProgressOnATerminal_IsOneLineWithTheTimeLeft) {
  AttachUnits(0x05, 0x07);
  terminal_.columns = 40;
  EXPECT_EQ(Run("send wide.json 05-07"), 0);
  EXPECT_THAT(terminal_.error, HasSubstr("\runit 05 (1 of 3): port 2 of 8\r"));
  EXPECT_THAT(terminal_.error, HasSubstr("\runit 06 (2 of 3), 00:04 left\r"));
  EXPECT_THAT(terminal_.error, EndsWith("\r" + std::string(39, ' ') + "\r"));
  EXPECT_EQ(terminal_.error.find('\n'), std::string::npos);
  const QStringList drawn = QString::fromStdString(terminal_.error).split(u'\r');
  EXPECT_EQ(std::ranges::adjacent_find(drawn), drawn.end());
  terminal_.columns = 46;
  EXPECT_EQ(Run("send wide.json 08"), 1);
  const std::string indent(25, ' ');
  EXPECT_THAT(terminal_.out, HasSubstr("Unit 08 does not\n" + indent + "answer: check its\n" + indent));
}

TEST_F(UnitFiles, Show_DoesNothingToTheTerminal) {
  Edit("named.json", "\"port\": 2,",
       "\"port\": 2, \"name\": \"a\\u001b[2J\\nb\\u202e456789012345678901234567\",");
  EXPECT_EQ(Run("show named.json"), 0);
  EXPECT_THAT(terminal_.out, HasSubstr("\n2     a\uFFFD[2J b\uFFFD4567890123456...  servo  500 to 2500"));
}

}  // namespace
}  // namespace tendril::test
