// The shell completion and the manual page against the table of commands.
#include <gtest/gtest.h>

#include <QFile>
#include <QProcess>
#include <QRegularExpression>
#include <set>
#include <stdexcept>

#include "ctl/command_table.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;
using Words = std::set<QString>;

// The lines that bash prints for `script`; $1 is a file of packaging/completion.
Words Bash(const QString& script, const QString& file, const QStringList& arguments) {
  QProcess bash;
  bash.setWorkingDirectory(QStringLiteral(TENDRIL_SOURCES));
  bash.start(u"bash"_s,
             QStringList{u"-c"_s, script, u"bash"_s, u"packaging/completion/"_s + file} + arguments);
  if (!bash.waitForFinished()) throw std::runtime_error("bash does not end");
  EXPECT_EQ(bash.readAllStandardError().toStdString(), "") << arguments.join(u' ').toStdString();
  const QStringList lines = QString::fromUtf8(bash.readAllStandardOutput()).split(u'\n', Qt::SkipEmptyParts);
  return {lines.begin(), lines.end()};
}

// What bash offers after "tendril-ctl" and `words`, of which the last one is begun.
Words Offered(const QStringList& words) {
  return Bash(
      u"source $1; shift; COMP_WORDS=(tendril-ctl \"$@\"); COMP_CWORD=$#; _tendril_ctl;"
      "printf '%s\\n' \"${COMPREPLY[@]}\""_s,
      u"tendril-ctl"_s, words);
}

// What is declared for zsh after `command`, or without one: "--json", "--port:" with a value, "1:FILE:_files". The file
// has no syntax that bash does not know.
Words Declared(const QString& command) {
  return Bash(
      u"_arguments() { if [[ $1 == -C && $command ]]; then state=argument; else printf '%s\\n' \"$@\"; fi; };"
      "completion() { source $1; }; command=$2; words=(- \"$2\");"
      "completion $1 | sed 's/\\[.*\\]\\(:\\?\\).*/\\1/'"_s,
      u"_tendril-ctl"_s, {command});
}

// The matches of `pattern`, which has a group, in `text`.
Words Matches(const char* pattern, const QString& text) {
  Words words;
  const QRegularExpression expression(QString::fromLatin1(pattern), QRegularExpression::MultilineOption);
  for (const auto& match : expression.globalMatch(text)) words.insert(match.captured(1));
  return words;
}
Words Matches(const char* pattern, const Words& lines) {
  return Matches(pattern, QStringList(lines.begin(), lines.end()).join(u'\n'));
}

// Of a command; those that take a value end with `value`.
Words OptionsOf(const CommandInfo& command, const char* value = "") {
  Words options{u"--help"_s};
  for (const OptionInfo& option : Options()) {
    if ((command.options & option.option) != 0)
      options.insert(u"--"_s + option.name + QLatin1StringView(option.value.isEmpty() ? "" : value));
  }
  return options;
}

Words CommandNames() {
  Words names;
  for (const CommandInfo& command : Commands()) names.insert(command.name);
  return names;
}

TEST(Completion, ShellsOfferTheCommands) {
  EXPECT_EQ(Offered({QString()}), CommandNames());
  EXPECT_EQ(Offered({u"--"_s}), (Words{u"--help"_s, u"--version"_s}));
  for (const OptionInfo& option : Options()) {
    QStringList words{u"--"_s + option.name, u"x"_s, QString()};
    if (option.value.isEmpty()) words.removeAt(1);
    EXPECT_EQ(Offered(words), CommandNames()) << words.join(u' ').toStdString();
  }
  EXPECT_EQ(Matches("([a-z-]+)", *Matches(R"(^1:command:\((.*)\))", Declared({})).begin()), CommandNames());
}

TEST(Completion, ShellsOfferWhatACommandTakes) {
  for (const CommandInfo& command : Commands()) {
    SCOPED_TRACE(command.name.data());
    const QString name = command.name;
    const Words declared = Declared(name);
    EXPECT_EQ(Offered({name, u"-"_s}), OptionsOf(command));
    EXPECT_EQ(Matches("^(--.*)", declared), OptionsOf(command, ":"));
    const bool file = command.arguments.startsWith("FILE"_L1),
               folder = command.arguments.startsWith("FOLDER"_L1);
    EXPECT_EQ(Offered({name, u"CMakeL"_s}), file ? Words{u"CMakeLists.txt"_s} : Words{});
    EXPECT_EQ(Offered({name, u"packag"_s}), file || folder ? Words{u"packaging"_s} : Words{});
    EXPECT_EQ(declared.count(u"1:FILE:_files"_s), file);
    EXPECT_EQ(declared.count(u"1:FOLDER:_files -/"_s), folder);
  }
}

TEST(ManualPage, HasWhatTheTableHas) {
  QFile file(QStringLiteral(TENDRIL_SOURCES "/packaging/man/tendril-ctl.1"));
  ASSERT_TRUE(file.open(QIODevice::ReadOnly));
  const QString page = QString::fromUtf8(file.readAll()).remove(u'\\');
  Words calls, options{u"--help"_s, u"--version"_s}, codes;
  for (const CommandInfo& command : Commands()) {
    calls.insert((command.name + u' ' + command.arguments).trimmed());
    if (!command.other_arguments.isEmpty()) calls.insert(command.name + u' ' + command.other_arguments);
    for (const QString& option : OptionsOf(command)) options.insert(option);
  }
  for (const ExitCode& code : ExitCodes()) codes.insert(QString::number(code.code));
  EXPECT_EQ(Matches("^.SS (.*)", page), calls);
  EXPECT_EQ(Matches("^.BI? (--[a-z-]*)", page), options);
  EXPECT_EQ(Matches("(--[a-z-]+)", page), options) << "nothing else is mentioned";
  EXPECT_EQ(Matches("^.B ([0-9]+)$", page), codes);
}

}  // namespace
}  // namespace tendril::ctl
