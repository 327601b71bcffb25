#include "app/bench_options.h"

#include <QCommandLineParser>
#include <QString>
#include <algorithm>
#include <stdexcept>
#include <string>
#include <string_view>

#include "platform/paths.h"
#include "platform/process_list.h"

namespace tendril {
namespace {

// How a program that looks for a running Control Panel finds this one.
#ifdef __linux__
constexpr char kOnTheName[] = "\n\nWith a Control Panel, the list of processes shows the bench as %1.";
#else
constexpr char kOnTheName[] =
    "\n\nA program that looks for a running Control Panel looks for %1, and this system has no call "
    "that\nchanges a process's name: copy the bench to a file of that name and run the copy.";
#endif

QString ToText(std::string_view latin1) {
  return QString::fromLatin1(latin1.data(), qsizetype(latin1.size()));
}

// The lines of --help about things that have a name and a description.
QString ListOf(const auto& kinds) {
  QString list;
  for (const auto& kind : kinds) {
    list += QStringLiteral("\n  %1 %2").arg(ToText(kind.name), -16).arg(ToText(kind.description));
  }
  return list;
}

std::uint8_t ParseUnitId(const QString& text) {
  bool valid = false;
  const uint id = text.toUInt(&valid, 16);
  if (!valid || id < 0x01 || id > 0xFF || text.size() > 2) {
    throw std::invalid_argument("\"" + text.toStdString() +
                                "\" is no unit ID: it is a hexadecimal number, 01 to FF.");
  }
  return static_cast<std::uint8_t>(id);
}

// Gives the unit that `text`, "<name>[:ID]", names its fault; without an ID, the first unit. Adds a unit with that
// ID if there is none.
void AddFault(std::vector<BenchUnit>& units, const QString& text) {
  const QString name = text.section(QLatin1Char(':'), 0, 0);
  const FaultKind* kind = FindFaultKind(name.toStdString());
  if (kind == nullptr) {
    throw std::invalid_argument("\"" + name.toStdString() + "\" is no fault. --help lists them.");
  }
  const bool names_unit = text.contains(QLatin1Char(':'));
  const std::uint8_t id = names_unit ? ParseUnitId(text.section(QLatin1Char(':'), 1)) : units.front().id;
  auto unit = std::find_if(units.begin(), units.end(), [&](const BenchUnit& each) { return each.id == id; });
  if (unit == units.end()) unit = units.insert(unit, {.id = id});
  unit->fault = kind;
}

// A decimal number from `least` to `most`, or nothing.
std::optional<std::uint32_t> ParseNumber(const QString& text, std::uint32_t least, std::uint32_t most) {
  bool valid = false;
  const uint number = text.toUInt(&valid);
  if (!valid || number < least || number > most) return std::nullopt;
  return number;
}

// The number of the comm port that `link` makes, by its name com<number>.
std::optional<std::uint32_t> CommPortOf(const std::filesystem::path& link) {
  const QString name = QString::fromStdString(link.filename().string());
  if (!name.startsWith(QLatin1String("com"))) return std::nullopt;
  return ParseNumber(name.mid(3), 1, 255);
}

BenchPanelOptions ParsePanel(const QString& tcp_port, const std::filesystem::path& link) {
  const std::optional<std::uint32_t> number = ParseNumber(tcp_port, 0, 65535);
  if (!number) {
    throw std::invalid_argument("\"" + tcp_port.toStdString() +
                                "\" is no TCP port: it is a number, 0 to 65535.");
  }
  const std::optional<std::uint32_t> comm_port = CommPortOf(link);
  if (!comm_port) {
    throw std::invalid_argument(
        "--control-panel needs a --link that is named com1 to com255: the Control Panel "
        "is asked for a port by its number.");
  }
  return {.tcp_port = static_cast<std::uint16_t>(*number),
          .comm_port = static_cast<std::uint8_t>(*comm_port)};
}

// Gives the panel the behaviour that `text`, "<name>[:replies]", names.
void SetBehaviour(BenchPanelOptions& panel, const QString& text) {
  const QString name = text.section(QLatin1Char(':'), 0, 0);
  panel.behaviour = FindPanelBehaviour(name.toStdString());
  if (panel.behaviour == nullptr) {
    throw std::invalid_argument("\"" + name.toStdString() + "\" is no behaviour. --help lists them.");
  }
  if (!text.contains(QLatin1Char(':'))) return;
  const QString replies = text.section(QLatin1Char(':'), 1);
  panel.misbehaving_replies = ParseNumber(replies, 1, 1'000'000);
  if (!panel.misbehaving_replies) {
    throw std::invalid_argument("\"" + replies.toStdString() + "\" is no number of replies.");
  }
}

QString Text(const char* latin1) { return QString::fromLatin1(latin1); }

struct CommandLine {
  QCommandLineOption unit{Text("unit"),
                          Text("ID of a unit, in hexadecimal; may be given repeatedly. Default: 01 and 0A."),
                          Text("ID")};
  QCommandLineOption fault{Text("fault"), Text("Let a unit behave badly; without an ID the first one."),
                           Text("name[:ID]")};
  QCommandLineOption link{Text("link"), Text("Where to put the link to the device."), Text("path"),
                          QString::fromStdString((ConfigFolder() / "ports" / "com1").string())};
  QCommandLineOption no_echo{
      Text("no-echo"),
      Text("Do not echo what the program sends, as adapters do that switch their direction by themselves.")};
  QCommandLineOption control_panel{
      Text("control-panel"),
      Text("Play the Control Panel too: hold the device until a program asks for it at this TCP port of "
           "127.0.0.1. With 0 the system chooses one."),
      Text("TCP port")};
  QCommandLineOption panel_behaviour{
      Text("panel-behaviour"),
      Text("Let the Control Panel behave badly; with a number, in its first replies only."),
      Text("name[:replies]")};
  QCommandLineOption quiet{Text("quiet"),
                           Text("Do not print what crosses the line, nor the Control Panel's connections.")};

  QString Description() const {
    return Text(
               "Virtual units on a serial line of 19200 baud, for trying tendril-utility without hardware. "
               "The "
               "line is\na pseudo-terminal; its link makes it a comm port of the utility.\n\nFaults:") +
           ListOf(FaultKinds()) + Text("\n\nBehaviours of the Control Panel:") +
           ListOf(PanelBehaviourKinds()) + Text(kOnTheName).arg(Text(kControlPanelProgram)) +
           Text(
               "\n\nThe exit code is 0 when the bench is stopped, 1 for invalid options, and 2 when the "
               "device, "
               "its link\nor the TCP port is not available.");
  }
};

}  // namespace

BenchOptions ParseBenchOptions(const QCoreApplication& application) {
  const CommandLine line;
  QCommandLineParser parser;
  parser.setApplicationDescription(line.Description());
  parser.addHelpOption();
  parser.addVersionOption();
  parser.addOptions(
      {line.unit, line.fault, line.link, line.no_echo, line.control_panel, line.panel_behaviour, line.quiet});
  parser.process(application);
  if (!parser.positionalArguments().isEmpty()) {
    throw std::invalid_argument("\"" + parser.positionalArguments().constFirst().toStdString() +
                                "\" is no option. --help lists them.");
  }

  BenchOptions options;
  for (const QString& id : parser.values(line.unit)) options.units.push_back({.id = ParseUnitId(id)});
  if (options.units.empty()) options.units = {{.id = 0x01}, {.id = 0x0A}};
  for (const QString& each : parser.values(line.fault)) AddFault(options.units, each);
  options.link = parser.value(line.link).toStdString();
  if (options.link.empty()) throw std::invalid_argument("--link needs a path.");
  options.echo = !parser.isSet(line.no_echo);
  options.quiet = parser.isSet(line.quiet);
  if (parser.isSet(line.control_panel))
    options.panel = ParsePanel(parser.value(line.control_panel), options.link);
  if (parser.isSet(line.panel_behaviour)) {
    if (!options.panel) throw std::invalid_argument("--panel-behaviour needs --control-panel.");
    SetBehaviour(*options.panel, parser.value(line.panel_behaviour));
  }
  return options;
}

}  // namespace tendril
