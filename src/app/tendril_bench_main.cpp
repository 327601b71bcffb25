// tendril-bench: virtual units on a pseudo-terminal, for trying tendril-utility without hardware, and a virtual
// Control Panel that holds it.

#include <fcntl.h>
#include <unistd.h>
#ifdef __linux__
#include <sys/prctl.h>
#endif

#include <QCoreApplication>
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <exception>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "app/bench_options.h"
#include "app/bench_panel.h"
#include "app/console.h"
#include "app/paced_line.h"
#include "app/pseudo_terminal.h"
#include "app/quit_on_signal.h"
#include "bench/printers.h"
#include "bench/virtual_line.h"
#include "bench/virtual_unit.h"
#include "platform/hex_text.h"
#include "platform/paths.h"
#include "platform/process_list.h"
#include "platform/qt/qt_timer.h"

namespace tendril {
namespace {

constexpr int kExitUsage = 1;
constexpr int kExitSetup = 2;

void IntroducePanel(Console& console, const BenchPanelOptions& options, std::uint16_t tcp_port) {
  char registry_value[9];
  std::snprintf(registry_value, sizeof registry_value, "%08x", static_cast<unsigned>(tcp_port));
  console.Print("  panel   127.0.0.1, TCP port " + std::to_string(tcp_port) + "; it holds Comm " +
                std::to_string(options.comm_port) + " until it is asked for it");
  console.Print("          in the registry: \"DMXListenerPort\"=dword:" + std::string(registry_value));
#ifdef __linux__
  console.Print("          in the list of processes: " + std::string(kControlPanelProgram));
#endif
  if (options.behaviour == nullptr) return;
  const std::string limit = options.misbehaving_replies
                                ? " (first " + std::to_string(*options.misbehaving_replies) + ")"
                                : std::string();
  console.Print("          " + std::string(options.behaviour->description) + limit);
}

void Introduce(Console& console, const BenchOptions& options, const PseudoTerminal& terminal,
               const DeviceLink& link, const BenchPanel* panel) {
  const std::string name = options.link.filename().string();
  const bool is_port = name.starts_with("com") && options.link.parent_path() == ConfigFolder() / "ports";
  console.Print("Tendril bench: virtual units on a serial line, 19200 baud, 8-N-1, " +
                std::string(options.echo ? "with echo" : "without echo"));
  console.Print("  device  " + terminal.device());
  console.Print("  link    " + options.link.string() + (is_port ? "  (Comm " + name.substr(3) + ")" : ""));
  if (!link.replaced().empty())
    console.Print("          which pointed to " + link.replaced().string() + " before");
  for (const BenchUnit& unit : options.units) {
    console.Print("  unit    " + HexByte(unit.id) +
                  (unit.fault == nullptr ? "" : "  " + std::string(unit.fault->description)));
  }
  if (panel != nullptr) IntroducePanel(console, *options.panel, panel->tcp_port());
  console.Print("Choose the comm port and a unit's ID in tendril-utility. Ctrl+C ends the bench.");
  if (!options.quiet) console.Print("What crosses the line, with the time in seconds:");
  console.Flush();
}

int Run(QCoreApplication& application, const BenchOptions& options) {
#ifdef __linux__
  ::prctl(PR_SET_TIMERSLACK, 1'000);  // ns; by default waits are 50 us longer, a tenth of a byte
#endif
  const QuitOnSignal quit_on_signal;  // so that the link is removed
  std::signal(SIGPIPE, SIG_IGN);      // goes on when the output is not read
  const PseudoTerminal terminal;
  // A pseudo-terminal has no RTS: the adapter at its far end goes by what the program sends.
  VirtualLine line({.echo = options.echo, .driver_follows_rts = false});
  std::vector<std::unique_ptr<VirtualUnit>> units;
  for (const BenchUnit& unit : options.units) {
    units.push_back(unit.fault == nullptr ? std::make_unique<VirtualUnit>(unit.id)
                                          : unit.fault->make(unit.id));
    line.Attach(*units.back());
  }
  Console console;
  const PacedLine paced(terminal, line, console, !options.quiet);
  QtTimerFactory timers({});
  std::unique_ptr<BenchPanel> panel;
  if (options.panel) {
    panel = std::make_unique<BenchPanel>(*options.panel, terminal, timers, [&](const std::string& text) {
      console.Print(text);
      console.Flush();
    });
    if (!options.quiet) panel->ShowConnections([&] { return paced.NowUs(); });
#ifdef __linux__  // macOS has no call for this; --help says what to do there
    ::prctl(PR_SET_NAME, kControlPanelProgram);
#endif
  }
  // Last of all: a program that finds the link finds everything ready.
  const DeviceLink link(options.link, terminal.device());
  Introduce(console, options, terminal, link, panel.get());
  return application.exec();
}

int Fail(int exit_code, const std::exception& fault) {
  std::fprintf(stderr, "tendril-bench: %s\n", fault.what());
  return exit_code;
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) {
  QCoreApplication application(argc, argv);
  QCoreApplication::setApplicationName(QStringLiteral("tendril-bench"));
  QCoreApplication::setApplicationVersion(QStringLiteral(TENDRIL_VERSION));
  try {
    return tendril::Run(application, tendril::ParseBenchOptions(application));
  } catch (const std::invalid_argument& fault) {
    return tendril::Fail(tendril::kExitUsage, fault);
  } catch (const std::exception& fault) {
    return tendril::Fail(tendril::kExitSetup, fault);
  }
}
