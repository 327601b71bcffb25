#include "ctl/command_help.h"

#include <QList>
#include <QStringList>
#include <algorithm>
#include <utility>

#include "ctl/folded_text.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

constexpr qsizetype kColumns = 80;

// Folds `text`; the lines after the first one begin with `indent` spaces, where the first one already is.
QString Wrapped(const QString& text, qsizetype indent = 0) {
  return Folded(text, kColumns - indent).join(u'\n' + QString(indent, u' ')) + u'\n';
}

// "  --port N   The comm port." with the descriptions in one column.
class Rows {
 public:
  void Add(const QString& term, QLatin1StringView description) {
    rows_.emplaceBack(term, description);
    width_ = std::max(width_, term.size());
  }
  QString Lines() const {
    QString lines;
    for (const auto& [term, description] : rows_)
      lines += u"  "_s + term.leftJustified(width_ + 2) + Wrapped(description, width_ + 4);
    return lines;
  }

 private:
  QList<std::pair<QString, QString>> rows_;
  qsizetype width_ = 0;
};

// "send FILE ID...".
QString Call(const CommandInfo& command, QLatin1StringView arguments) {
  return (command.name + u' ' + arguments).trimmed();
}

QString OptionLines(unsigned options) {
  Rows rows;
  for (const OptionInfo& info : Options()) {
    if ((options & info.option) != 0)
      rows.Add((u"--"_s + info.name + u' ' + info.value).trimmed(), info.description);
  }
  rows.Add(u"-h, --help"_s, "Print this help."_L1);
  return rows.Lines();
}

}  // namespace

QString ProgramHelp() {
  Rows commands;
  for (const CommandInfo& command : Commands()) {
    commands.Add(Call(command, command.arguments), command.summary);
  }
  Rows exit_codes;
  for (const auto& [code, meaning] : ExitCodes()) exit_codes.Add(QString::number(code), meaning);
  return u"Usage: tendril-ctl COMMAND [ARGUMENT...] [OPTION...]\n\n"_s +
         Wrapped(u"Set up Tendril units from a terminal and from scripts."_s) + u"\nCommands:\n"_s +
         commands.Lines() + u'\n' +
         Wrapped(
             u"tendril-ctl COMMAND --help, or help COMMAND, describes a command and its options; --version "
             u"prints "
             "the version."_s) +
         u'\n' +
         Wrapped(
             u"An ID is two hexadecimal digits, 01 to FD. Several: 0A-1F, or 01,05,20-28, or one after the "
             "other. A file or a folder whose name looks like that is given as ./01."_s) +
         u'\n' +
         Wrapped(
             u"A FILE is a configuration as text, as tendril-utility copies it; configuration-format.md "
             "describes it. The FILE - is standard input."_s) +
         u"\nExit codes:\n"_s + exit_codes.Lines();
}

QString CommandHelp(const CommandInfo& command) {
  QString text = u"Usage: tendril-ctl "_s + Call(command, command.arguments) + u" [OPTION...]\n"_s;
  if (!command.other_arguments.isEmpty())
    text += u"       tendril-ctl "_s + Call(command, command.other_arguments) + u" [OPTION...]\n"_s;
  return text + u'\n' + Wrapped(command.description) + u"\nOptions:\n"_s + OptionLines(command.options) +
         u"\nExample:\n  tendril-ctl "_s + command.example + u'\n';
}

}  // namespace tendril::ctl
