#include "ctl/command_line.h"

#include <gtest/gtest.h>

#include <tuple>

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;
using Ids = std::vector<std::uint8_t>;

// `line`: with spaces between the arguments.
std::variant<CommandLine, EarlyEnd> Parse(const QString& line) {
  return ParseCommandLine((u"tendril-ctl "_s + line).split(u' '));
}
CommandLine Understood(const char* line) { return std::get<CommandLine>(Parse(QString::fromLatin1(line))); }

TEST(CommandLine, UnitsAreTakenOnceInTheOrderGiven) {
  EXPECT_EQ(Understood("get fd 0A-0c,1 0b 01,02").units, (Ids{0xFD, 0x0A, 0x0B, 0x0C, 0x01, 0x02}));
  EXPECT_EQ(Understood("get 01-FD").units.size(), 253u);
  EXPECT_EQ(Understood("backup ./01 --port 2").units, Ids{});
}

TEST(CommandLine, CommandWithItsOptions) {
  const CommandLine send =
      Understood("--port 255 send --backup old a.json 07 --no-compare --force --trace --quiet");
  EXPECT_EQ(std::tie(send.command, send.file, send.port, send.backup, send.compare, send.force),
            std::make_tuple(Command::kSend, u"a.json"_s, std::int16_t{255}, u"old"_s, false, true));
  EXPECT_EQ(std::tie(send.trace, send.quiet, send.json, send.demo),
            std::make_tuple(true, true, false, false));
  const CommandLine find = Understood("find 0a-1F --demo --take-port --json");
  EXPECT_EQ(std::tie(find.first, find.last, find.demo, find.take_port, find.json),
            std::make_tuple(0x0A, 0x1F, true, true, true));
  EXPECT_EQ(Understood("find").last, 0xFD);
  const CommandLine set_id = Understood("set-id b --alone --yes");
  EXPECT_EQ(std::tie(set_id.new_id, set_id.alone, set_id.yes), std::make_tuple(0x0B, true, true));
  EXPECT_TRUE(Understood("restore there 01 --yes").yes);
  EXPECT_EQ(Understood("preset WIDE --output w --force").preset, &kPresets[2]);
  EXPECT_EQ(Understood("compare x ./01").other_file, u"./01"_s);
  EXPECT_EQ(Understood("compare -- -x 01 2").units, (Ids{1, 2}));
  EXPECT_EQ(Understood("get 1-2 --output here").output, u"here"_s);
}

TEST(CommandLine, WrongUseIsOneSentence) {
  for (const auto& [line, sentence] : std::vector<std::pair<const char*, const char*>>{
           {"", "a command is missing; see tendril-ctl --help."},
           {"send", "send needs a FILE; see tendril-ctl send --help."},
           {"send 01 02", "send needs a FILE; one named 01 is given as ./01."},
           {"restore  ", "restore needs a FOLDER; see tendril-ctl restore --help."},
           {"send x", "send needs at least one ID; see tendril-ctl send --help."},
           {"send x 01,,02", "\"\" is no unit ID: IDs are hexadecimal, 01 to FD."},
           {"get 100", "\"100\" is no unit ID: IDs are hexadecimal, 01 to FD."},
           {"get 1F-0A", "\"1F-0A\" is no range of unit IDs: the smaller one comes first."},
           {"get 00", "no unit can be found at 00: IDs are 01 to FD."},
           {"find 01-FE",
            "a unit at FE cannot be reached through an adapter with an echo: IDs are 01 to FD."},
           {"set-id FF",
            "FF addresses every unit on the line: only set-id uses it, to give a unit an ID from 01 to FD."},
           {"set-id 1-2", "\"1-2\" is no single ID: set-id gives one unit one ID."},
           {"find 1,2", "\"1,2\" is no range: find takes one, like 01-20."},
           {"compare x", "compare needs at least one ID or a second FILE; see tendril-ctl compare --help."},
           {"compare x y --demo",
            "--demo is of no use: two files are compared without a unit; see tendril-ctl compare --help."},
           {"preset huge", "\"huge\" is no preset: there are narrow, medium and wide."},
           {"ports --port 1", "ports has no option --port; see tendril-ctl ports --help."},
           {"find --port", "missing value after --port; see tendril-ctl find --help."},
           {"find --port 256",
            "\"256\" is no port: --port takes a number, 1 to 255; tendril-ctl ports lists them."},
           {"find --port 1 --port 2", "--port is given twice; see tendril-ctl find --help."},
           {"get 1 --output --force", "missing value after --output; see tendril-ctl get --help."},
           {"bogus --help", "\"bogus\" is no command; see tendril-ctl --help."},
           {"get 1,2 --output -", "--output - takes one unit: the files of several go into a folder."},
           {"get 1 --output - --force",
            "--force is of no use: no file is written; see tendril-ctl get --help."},
           {"send x 1 --force", "--force is of no use: no file is written; see tendril-ctl send --help."}}) {
    const auto result = Parse(QString::fromLatin1(line));
    const auto* end = std::get_if<EarlyEnd>(&result);
    ASSERT_NE(end, nullptr) << line;
    EXPECT_EQ(end->exit_code, 2) << line;
    EXPECT_EQ(end->text.toStdString(), sentence);
  }
}

// Each command is described, in lines that a terminal has room for.
TEST(CommandLine, HelpFitsATerminal) {
  QStringList helps{QString()};
  for (const CommandInfo& command : Commands()) helps += command.name + u' ';
  for (const QString& command : helps) {
    const auto end = std::get<EarlyEnd>(Parse(command + u"--help"_s));
    EXPECT_EQ(end.exit_code, 0);
    EXPECT_EQ(end.text, std::get<EarlyEnd>(Parse(u"help "_s + command.trimmed())).text);
    EXPECT_EQ(end.text, std::get<EarlyEnd>(Parse(command + u"-h"_s)).text);
    EXPECT_TRUE(end.text.startsWith(u"Usage: tendril-ctl "_s + command)) << end.text.toStdString();
    for (const QString& line : end.text.split(u'\n')) EXPECT_LE(line.size(), 80) << line.toStdString();
  }
}

}  // namespace
}  // namespace tendril::ctl
