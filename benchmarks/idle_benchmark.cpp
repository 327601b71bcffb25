// What the program costs while its window is open and idle: of the processor, and of memory against a
// program with an empty window.
#include <QEventLoop>
#include <QTimer>
#include <QWidget>
#include <cstdio>
#include <ctime>
#include <memory>
#include <stdexcept>
#include <vector>

#include "app/utility_program.h"
#include "measuring.h"
#include "platform/tcp_socket.h"
#include "platform/wait_for.h"
#include "support/bench_process.h"
#include "support/user.h"

namespace tendril {
namespace {

using test::BenchProcess;
using test::RunFor;
using test::User;
using test::WaitFor;

constexpr int kForMs = 20000;
constexpr int kSettleMs = 1500;  // a button's last fading, a command's last reply
constexpr double kMegabyte = 1e6;

void Require(bool met, const char* otherwise) {
  if (!met) throw std::runtime_error(otherwise);
}

bool Measure(const char* what, double max_percent) {
  RunFor(kSettleMs);
  QEventLoop loop;
  QTimer::singleShot(kForMs, Qt::PreciseTimer, &loop, &QEventLoop::quit);
  const std::clock_t begin = std::clock();  // of all threads
  loop.exec();
  const double percent = 100 * static_cast<double>(std::clock() - begin) / CLOCKS_PER_SEC * 1000 / kForMs;
  std::printf("%s: %.2f %% of a core in %d s (below %.1f)\n", what, percent, kForMs / 1000, max_percent);
  return percent < max_percent;
}

bool MeasureMemory(double empty, double idle) {
  constexpr double kMaxRatio = 1.5;
  std::printf("resident: %.1f MB, with an empty window %.1f MB, ratio %.2f (at most %.1f)\n",
              idle / kMegabyte, empty / kMegabyte, idle / empty, kMaxRatio);
  return idle / empty <= kMaxRatio;
}

bool MeasureAll() {
  auto empty_window = std::make_unique<QWidget>();
  empty_window->resize(1280, 800);
  empty_window->show();
  RunFor(kSettleMs);
  const double empty = ResidentBytes();
  empty_window.reset();

  BenchProcess bench;
  const QStringList panel{QStringLiteral("--control-panel"), bench.WriteRegistry()};
  UtilityProgram program;
  program.window.resize(1280, 800);
  program.window.show();
  User user;
  user.SetWindow(program.window);

  user.Rest(true);
  bool within_bounds = Measure("trying to connect where nothing listens", 1);
  bench.Start(panel);
  const auto connected = [&] { return program.wsCLI.State() == TcpState::kConnected; };
  Require(WaitFor(connected), "It had given up connecting");

  user.Rest(false);
  user.ChoosePort(1);
  Require(WaitFor([&] { return user.read.size() == 2; }), "The Control Panel is not asked for the port");
  RunFor(kSettleMs);
  user.ChoosePort(1);
  Require(program.Serial1.PortOpen(), "The port does not open");
  user.Rest(true);
  within_bounds &= Measure("connected, with the port open", 0.5);
  Require(connected() && program.Serial1.PortOpen(), "It does not stay connected");

  bench.Kill();
  Require(WaitFor([&] { return !program.Serial1.PortOpen(); }), "The loss of the adapter goes unnoticed");
  // The bench was both.
  within_bounds &= Measure("unplugged, and trying to connect where nothing listens any more", 1);
  return MeasureMemory(empty, ResidentBytes()) && within_bounds;
}

}  // namespace
}  // namespace tendril

int main(int argc, char** argv) { return tendril::RunBenchmark(argc, argv, tendril::MeasureAll); }
