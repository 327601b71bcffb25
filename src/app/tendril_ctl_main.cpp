// tendril-ctl: sets up Tendril units from a terminal and from scripts.
#include <QAbstractEventDispatcher>
#include <QCoreApplication>
#include <QDateTime>
#include <QEventLoop>
#include <QTemporaryDir>
#include <exception>
#include <functional>
#include <memory>
#include <optional>
#include <variant>

#include "app/demo_bench.h"
#include "app/quit_on_signal.h"
#include "app/system_terminal.h"
#include "bench/virtual_tcp_socket.h"
#include "ctl/command_line.h"
#include "ctl/environment.h"
#include "ctl/program.h"
#include "platform/memory_registry.h"
#include "platform/paths.h"
#include "platform/qt/path_text.h"
#include "platform/qt/qt_serial_device.h"
#include "platform/qt/qt_tcp_socket.h"
#include "platform/qt/qt_timer.h"
#include "platform/registry_store.h"
#include "platform/standard_streams.h"
#include "platform/steady_clock.h"
#include "platform/system_processes.h"
#include "platform/system_registry.h"
#include "prefs/registry.h"
#include "serial/command_log.h"

namespace tendril {
namespace {

void Warn(const std::string& line) { WriteAll(Stream::kError, "tendril-ctl: " + line + "\n"); }

// Preferences that are missing have their defaults: only who looks for a fault reads of that.
std::function<void(const std::string&)> WarningsOf(const ctl::CommandLine& line) {
  return [shown = line.trace](const std::string& warning) {
    if (shown) Warn(warning);
  };
}

// On Windows a call that waits for events first sends those that are posted, and waits for others then. So it is made
// only when none was left.
struct EventLoopWaiting final : ctl::Waiting {
  void Until(const std::function<bool()>& done) override {
    auto& events = *QAbstractEventDispatcher::instance();
    while (!done()) {
      if (!events.processEvents(QEventLoop::AllEvents) && !done())
        events.processEvents(QEventLoop::WaitForMoreEvents);
    }
  }
};

// What both worlds share.
struct Process {
  EventLoopWaiting waiting;
  ctl::StopRequest stop;
  SystemTerminal terminal{waiting, stop};
  SteadyClock clock;
  QtTimerFactory timers{Warn};
};

int Run(const ctl::CommandLine& line, Process& process, SerialDevice& device, CommandLog& log,
        TcpSocket& socket, RegistryStore& store, const ProcessList& processes) {
  Registry registry(store, WarningsOf(line));
  ctl::Environment environment{device,
                               process.timers,
                               process.clock,
                               log,
                               socket,
                               registry,
                               processes,
                               process.waiting,
                               process.stop,
                               process.terminal,
                               [] { return QDateTime::currentMSecsSinceEpoch(); }};
  return ctl::RunCommand(line, environment);
}

int RunOnThisComputer(const ctl::CommandLine& line, Process& process) {
  QtSerialDevice device(Warn);
  FileCommandLog log(CommandLogPath());
  QtTcpSocket socket(Warn);
  const auto store = OpenSystemRegistry(WarningsOf(line));
  const auto processes = OpenProcessList();
  return Run(line, process, device, log, socket, *store, *processes);
}

// Without a number, Comm 1 is meant.
int RunDemo(ctl::CommandLine line, Process& process) {
  if (line.port == 0) line.port = 1;
  const QTemporaryDir scratch;
  DemoBench bench(process.clock, process.timers);
  const auto device = bench.ports.CreateDevice();
  FileCommandLog log(ToPath(scratch.filePath(QStringLiteral("HUtest.txt"))));
  VirtualTcpSocket socket(bench.panel, kDemoListenerPort, process.timers);
  MemoryRegistry store;
  const DemoProcesses processes;
  return Run(line, process, *device, log, socket, store, processes);
}

int Main() {
  const auto parsed = ctl::ParseCommandLine(QCoreApplication::arguments());
  Process process;
  if (const auto* end = std::get_if<ctl::EarlyEnd>(&parsed)) {
    const bool json = QCoreApplication::arguments().contains(QStringLiteral("--json"));
    return ctl::PrintEarlyEnd(*end, json, process.terminal);
  }
  PrepareStreams();
  std::optional<QuitOnSignal> on_signal;
  process.stop.SetWatch([&] { on_signal.emplace([&process](int signal) { process.stop.Make(signal); }); });
  const auto& line = std::get<ctl::CommandLine>(parsed);
  return line.demo ? RunDemo(line, process) : RunOnThisComputer(line, process);
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) {
  try {
    const QCoreApplication application(argc, argv);
    return tendril::Main();
  } catch (const std::exception& fault) {
    tendril::Warn(fault.what());
    return tendril::ctl::kExitNotAsWished;
  }
}
