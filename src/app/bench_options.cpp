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

// Gives the unit that `text`, "<name>[:ID]", speaks of its fault; without an ID, the first unit. A unit with
// that ID is added if there is none.
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

// Gives the panel the behaviour that `text`, "<name>[:replies]", speaks of.
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

}  // namespace

BenchOptions ParseBenchOptions(const QCoreApplication& application) {
  const auto text = [](const char* latin1) { return QString::fromLatin1(latin1); };
  const QString default_link = QString::fromStdString((ConfigFolder() / "ports" / "com1").string());
  const QCommandLineOption unit(text("unit"),
                                text("ID of a unit, in hexadecimal; may be given repeatedly. "
                                     "Default: 01 and 0A."),
                                text("ID"));
  const QCommandLineOption fault(
      text("fault"), text("Lets a unit behave badly; without an ID the first one."), text("name[:ID]"));
  const QCommandLineOption link(text("link"), text("Where to put the link to the device."), text("path"),
                                default_link);
  const QCommandLineOption no_echo(text("no-echo"),
                                   text("Do not echo what the program sends, as adapters do that "
                                        "switch their direction by themselves."));
  const QCommandLineOption quiet(
      text("quiet"), text("Do not print what crosses the line, nor the Control Panel's connections."));
  const QCommandLineOption control_panel(
      text("control-panel"),
      text("Play the Control Panel too: hold the device until a program asks for it at this TCP port of "
           "127.0.0.1. 0 lets the system choose one."),
      text("TCP port"));
  const QCommandLineOption panel_behaviour(
      text("panel-behaviour"),
      text("Lets the Control Panel behave badly; with a number, in its first replies only."),
      text("name[:replies]"));
  QCommandLineParser parser;
  parser.setApplicationDescription(
      text("Virtual units on a serial line of 19200 baud, for trying tendril-utility without hardware. The "
           "line is\n"
           "a pseudo-terminal; its link makes it a comm port of the utility.\n\nFaults:") +
      ListOfFaults() + text("\n\nBehaviours of the Control Panel:") + ListOfPanelBehaviours() +
      text(kOnTheName).arg(text(kControlPanelProgram)) +
      text("\n\nEnds with 0 when it is stopped, with 1 for options that make no sense, and with 2 when the "
           "device,\n"
           "its link or the TCP port cannot be had."));
  parser.addHelpOption();
  parser.addVersionOption();
  parser.addOptions({unit, fault, link, no_echo, control_panel, panel_behaviour, quiet});
  parser.process(application);
  if (!parser.positionalArguments().isEmpty()) {
    throw std::invalid_argument("\"" + parser.positionalArguments().constFirst().toStdString() +
                                "\" is no option. --help lists them.");
  }

  BenchOptions options;
  for (const QString& id : parser.values(unit)) options.units.push_back({.id = ParseUnitId(id)});
  if (options.units.empty()) options.units = {{.id = 0x01}, {.id = 0x0A}};
  for (const QString& each : parser.values(fault)) AddFault(options.units, each);
  options.link = parser.value(link).toStdString();
  if (options.link.empty()) throw std::invalid_argument("--link needs a path.");
  options.echo = !parser.isSet(no_echo);
  options.quiet = parser.isSet(quiet);
  if (parser.isSet(control_panel)) options.panel = ParsePanel(parser.value(control_panel), options.link);
  if (parser.isSet(panel_behaviour)) {
    if (!options.panel) throw std::invalid_argument("--panel-behaviour needs --control-panel.");
    SetBehaviour(*options.panel, parser.value(panel_behaviour));
  }
  return options;
}

}  // namespace tendril
