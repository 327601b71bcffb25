#include "ctl/command_line.h"

#include <QCommandLineParser>
#include <algorithm>
#include <utility>

#include "ctl/command_help.h"
#include "ctl/report.h"
#include "ctl/unit_ids.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

constexpr unsigned kOfTheLine = kPortOption | kTakePortOption | kDemoOption | kTraceOption;

struct WrongUse {
  QString sentence;
};

QString Quoted(const QString& text) { return u'"' + text + u'"'; }

// The sentence ends with where the help is; `command`: whose help.
[[noreturn]] void Refuse(const QString& reason, const CommandInfo* command) {
  const QString call = command == nullptr ? QString() : command->name + u' ';
  throw WrongUse{u"%1; see tendril-ctl %2--help."_s.arg(reason, call)};
}

std::vector<std::uint8_t> UnitIds(const QString& list) {
  const auto ids = ParseUnitIds(list.toStdString());
  if (const auto* fault = std::get_if<std::string>(&ids)) throw WrongUse{QString::fromStdString(*fault)};
  return std::get<std::vector<std::uint8_t>>(ids);
}

// The narrow preset is "narrow" or its full name, in any case.
const Preset* FindPreset(const QString& name) {
  for (const Preset& preset : kPresets) {
    const auto full = QLatin1StringView(preset.name.data(), qsizetype(preset.name.size()));
    const QLatin1StringView word = full.left(full.indexOf(u' '));
    if (name.compare(full, Qt::CaseInsensitive) == 0 || name.compare(word, Qt::CaseInsensitive) == 0)
      return &preset;
  }
  return nullptr;
}

// What stands after the command, apart from options.
class Arguments {
 public:
  Arguments(const CommandInfo& info, QStringList words) : info_(info), words_(std::move(words)) {}

  bool HasNext() const { return !words_.isEmpty(); }
  bool NextIsUnits() const { return HasNext() && LooksLikeUnitIds(words_.constFirst().toStdString()); }

  // `what`: "a FILE".
  QString Take(QLatin1StringView what) {
    if (!HasNext() || words_.constFirst().isEmpty()) Refuse(u"%1 needs %2"_s.arg(info_.name, what), &info_);
    return words_.takeFirst();
  }
  QString TakePath(QLatin1StringView what) {
    if (NextIsUnits()) {
      throw WrongUse{
          u"%1 needs %2; one named %3 is given as ./%3."_s.arg(info_.name, what, words_.constFirst())};
    }
    return Take(what);
  }
  // All that follow.
  std::vector<std::uint8_t> TakeUnits(QLatin1StringView what = "at least one ID"_L1) {
    if (!HasNext()) Refuse(u"%1 needs %2"_s.arg(info_.name, what), &info_);
    return UnitIds(std::exchange(words_, {}).join(u','));
  }
  void End() const {
    if (HasNext())
      Refuse(u"%1 is one argument too many for %2"_s.arg(Quoted(words_.constFirst()), info_.name), &info_);
  }

 private:
  const CommandInfo& info_;
  QStringList words_;
};

void TakeRange(Arguments& arguments, CommandLine& line) {
  if (!arguments.HasNext()) return;
  const QString range = arguments.Take("FIRST-LAST"_L1);
  if (range.contains(u','))
    throw WrongUse{u"%1 is no range: find takes one, like 01-20."_s.arg(Quoted(range))};
  const std::vector<std::uint8_t> ids = UnitIds(range);
  line.first = ids.front();
  line.last = ids.back();
}

void TakeNewId(Arguments& arguments, CommandLine& line) {
  const QString text = arguments.Take("the NEW ID"_L1);
  const std::vector<std::uint8_t> ids = UnitIds(text);
  if (ids.size() != 1)
    throw WrongUse{u"%1 is no single ID: set-id gives one unit one ID."_s.arg(Quoted(text))};
  line.new_id = ids.front();
}

void TakePreset(Arguments& arguments, CommandLine& line) {
  const QString name = arguments.Take("the NAME of a preset"_L1);
  line.preset = FindPreset(name);
  if (line.preset == nullptr)
    throw WrongUse{u"%1 is no preset: there are narrow, medium and wide."_s.arg(Quoted(name))};
}

void TakeArguments(Arguments arguments, CommandLine& line) {
  switch (line.command) {
    case Command::kPorts:
    case Command::kMonitor:
      break;
    case Command::kFind:
      TakeRange(arguments, line);
      break;
    case Command::kGet:
      line.units = arguments.TakeUnits();
      break;
    case Command::kSend:
      line.file = arguments.TakePath("a FILE"_L1);
      line.units = arguments.TakeUnits();
      break;
    case Command::kCompare:
      line.file = arguments.TakePath("a FILE"_L1);
      if (arguments.HasNext() && !arguments.NextIsUnits()) {
        line.other_file = arguments.Take("a second FILE"_L1);
      } else {
        line.units = arguments.TakeUnits("at least one ID or a second FILE"_L1);
      }
      break;
    case Command::kBackup:
    case Command::kRestore:
      line.folder = arguments.TakePath("a FOLDER"_L1);
      if (arguments.HasNext()) line.units = arguments.TakeUnits();
      break;
    case Command::kSetId:
      TakeNewId(arguments, line);
      break;
    case Command::kShow:
      line.file = arguments.TakePath("a FILE"_L1);
      break;
    case Command::kPreset:
      TakePreset(arguments, line);
      break;
  }
  arguments.End();
}

// The options of one command, as they are set.
class GivenOptions {
 public:
  GivenOptions(const CommandInfo& info, const QCommandLineParser& parser) : info_(info), parser_(parser) {
    for (const QString& name : parser.optionNames() + parser.unknownOptionNames()) CheckName(name);
    if (!parser.errorText().isEmpty()) {
      const QString error = parser.errorText().remove(u'\'');  // "Missing value after '--port'."
      Refuse(error.left(1).toLower() + error.sliced(1, error.size() - 2), &info_);
    }
  }

  bool Has(unsigned options) const { return (given_ & options) != 0; }
  // Empty if it is not given.
  QString Value(Option option) const {
    if (!Has(option)) return {};
    const QString name = RowOf(option).name;
    const QStringList values = parser_.values(name);
    if (values.size() > 1) Refuse(u"--%1 is given twice"_s.arg(name), &info_);
    if (values.constFirst().isEmpty() || values.constFirst().startsWith(u"--"))
      Refuse(u"missing value after --%1"_s.arg(name), &info_);
    return values.constFirst();
  }
  // Refuses `options`, which the command has but not with its present arguments.
  void RefuseAny(unsigned options, QLatin1StringView reason) const {
    for (const OptionInfo& option : Options()) {
      if (Has(options & option.option)) Refuse(u"--%1 %2"_s.arg(option.name, reason), &info_);
    }
  }

 private:
  static const OptionInfo& RowOf(Option option) {
    return *std::ranges::find(Options(), option, &OptionInfo::option);
  }
  void CheckName(const QString& name) {
    for (const OptionInfo& option : Options()) {
      if ((info_.options & option.option) == 0 || name != option.name) continue;
      given_ |= option.option;
      return;
    }
    Refuse(u"%1 has no option %2%3"_s.arg(info_.name, (name.size() == 1 ? "-"_L1 : "--"_L1), name), &info_);
  }

  const CommandInfo& info_;
  const QCommandLineParser& parser_;
  unsigned given_ = 0;
};

std::int16_t PortNumber(const QString& text) {
  bool valid = false;
  const int number = text.toInt(&valid);
  if (!valid || number < 1 || number > 255) {
    throw WrongUse{
        u"%1 is no port: --port takes a number, 1 to 255; tendril-ctl ports lists them."_s.arg(Quoted(text))};
  }
  return static_cast<std::int16_t>(number);
}

void TakeOptions(const GivenOptions& given, CommandLine& line) {
  if (given.Has(kPortOption)) line.port = PortNumber(given.Value(kPortOption));
  line.take_port = given.Has(kTakePortOption);
  line.demo = given.Has(kDemoOption);
  line.trace = given.Has(kTraceOption);
  line.quiet = given.Has(kQuietOption);
  line.json = given.Has(kJsonOption);
  line.compare = !given.Has(kNoCompareOption);
  line.force = given.Has(kForceOption);
  line.yes = given.Has(kYesToOtherUnitsOption | kYesToQuestionOption);
  line.alone = given.Has(kAloneOption);
  line.output = given.Value(kOutputFileOption) + given.Value(kOutputFileOrFolderOption);
  line.backup = given.Value(kBackupFolderOption);
  if (line.output == u"-") {
    if (line.units.size() > 1)
      throw WrongUse{u"--output - takes one unit: the files of several go into a folder."_s};
    line.output.clear();
  }

  if (!line.other_file.isEmpty())
    given.RefuseAny(kOfTheLine, "is of no use: two files are compared without a unit"_L1);
  const bool writes_files =
      line.command == Command::kBackup || (line.command == Command::kGet && line.units.size() > 1);
  if (!writes_files && line.output.isEmpty() && line.backup.isEmpty())
    given.RefuseAny(kForceOption, "is of no use: no file is written"_L1);
}

const CommandInfo* FindCommand(const QString& name) {
  const auto found =
      std::ranges::find_if(Commands(), [&](const CommandInfo& each) { return name == each.name; });
  return found == Commands().end() ? nullptr : &*found;
}

// All options of all commands: the command may stand after them.
void AddOptions(QCommandLineParser& parser) {
  QStringList known;
  for (const OptionInfo& option : Options()) {
    const QCommandLineOption added(option.name, option.description, option.value);
    if (!known.contains(option.name)) parser.addOption(added);
    known += option.name;
  }
  parser.addOption(QCommandLineOption(QStringList{u"h"_s, u"help"_s}));
  parser.addOption(QCommandLineOption(QStringList{u"v"_s, u"version"_s}));
}

EarlyEnd HelpOf(const CommandInfo* info) { return {0, info == nullptr ? ProgramHelp() : CommandHelp(*info)}; }

// Takes the word "help" in place of the option: "help send".
bool TakeHelp(QStringList& words) {
  if (words.isEmpty() || words.constFirst() != u"help") return false;
  words.removeFirst();
  return true;
}

}  // namespace

QString CommandName(Command command) { return InfoOf(command).name; }

std::variant<CommandLine, EarlyEnd> ParseCommandLine(const QStringList& arguments) {
  QCommandLineParser parser;
  AddOptions(parser);
  parser.parse(arguments);
  QStringList words = parser.positionalArguments();
  const bool help = TakeHelp(words) || parser.isSet(u"help"_s);
  const QString name = words.isEmpty() ? QString() : words.takeFirst();
  const CommandInfo* info = FindCommand(name);
  if (parser.isSet(u"version"_s)) return EarlyEnd{0, u"tendril-ctl " TENDRIL_VERSION "\n"_s};
  try {
    if (!name.isEmpty() && info == nullptr) Refuse(u"%1 is no command"_s.arg(Quoted(name)), nullptr);
    if (help) return HelpOf(info);
    if (name.isEmpty()) Refuse(u"a command is missing"_s, nullptr);
    CommandLine line;
    line.command = info->command;
    const GivenOptions given(*info, parser);
    TakeArguments({*info, words}, line);
    TakeOptions(given, line);
    return line;
  } catch (const WrongUse& fault) {
    return EarlyEnd{kExitUsage, fault.sentence};
  }
}

}  // namespace tendril::ctl
