// adapter_trial [--times N]: the program, window and all, sends and reads N configurations through an adapter whose
// reads often find nothing, while its process meets the error number of an empty socket again and again. Fails when
// one command fails, when the port is taken for lost, or when there was no empty read to go wrong about.
#include <sys/socket.h>

#include <QApplication>
#include <QCommandLineParser>
#include <QTest>
#include <QTimer>
#include <array>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <stdexcept>
#include <string>

#include "app/utility_program.h"
#include "support/bench_process.h"
#include "support/emulated_adapter.h"
#include "support/user.h"

namespace tendril::test {
namespace {

constexpr int kLongestMs = 20000;
constexpr int kLookEveryMs = 5;
constexpr std::uint32_t kEmptyReadEvery = 4;

// Leaves the error number of a call that found nothing behind, as every network connection does.
class EmptySocket {
 public:
  EmptySocket() {
    if (::socketpair(AF_UNIX, SOCK_STREAM, 0, ends_.data()) != 0) throw std::runtime_error("no socket");
    look_.setTimerType(Qt::PreciseTimer);
    QObject::connect(&look_, &QTimer::timeout, &look_, [this] {
      char byte = 0;
      (void)!::recv(ends_[0], &byte, 1, MSG_DONTWAIT);
      ++looks_;
    });
    look_.start(kLookEveryMs);
  }
  ~EmptySocket() {
    for (const int end : ends_) ::close(end);
  }
  int looks() const { return looks_; }

 private:
  std::array<int, 2> ends_{};
  QTimer look_;
  int looks_ = 0;
};

int Run(int times) {
  Adapter().empty_read_every = kEmptyReadEvery;
  BenchProcess bench;
  bench.Start({QStringLiteral("--control-panel"), bench.WriteRegistry()}, true);
  UtilityProgram program;
  User user;
  program.window.show();
  user.SetWindow(program.window);
  user.ChoosePort(1);  // held by the Control Panel, which is asked for it
  if (!QTest::qWaitFor([&] { return bench.Printed().find("reply to 1: done") != std::string::npos; },
                       kLongestMs)) {
    throw std::runtime_error("the Control Panel does not give the port up");
  }
  user.ChoosePort(1);
  if (!program.Serial1.PortOpen()) throw std::runtime_error("the port does not open");

  const EmptySocket socket;
  int losses = 0, failures = 0;
  program.Serial1.SetPortHandler([&losses](bool open) { losses += open ? 0 : 1; });
  for (int command = 0; command < times; ++command) {
    const bool send = command % 2 == 0;
    user.read.clear();
    user.Press(send ? kSend : kGet);
    const bool over = QTest::qWaitFor([&] { return user.CommandOver(); }, kLongestMs);
    const std::string outcome = user.OutcomeLabel().text().toStdString();
    if (over && outcome == (send ? "SUCCESS: Send Complete!" : "SUCCESS: Upload Complete")) continue;
    ++failures;
    std::printf("command %d ended \"%s\"\n", command + 1, over ? outcome.c_str() : "never");
    for (const auto& [title, text] : user.read) std::printf("  %s: %s\n", title.c_str(), text.c_str());
    if (!program.Serial1.PortOpen()) user.ChoosePort(1);
  }
  program.Serial1.SetPortHandler(nullptr);
  const auto empty_reads = static_cast<unsigned long long>(Adapter().empty_reads);
  std::printf(
      "%d sends and gets: %d failed, the port was taken for lost %d times; %llu empty reads, %d looks at an "
      "empty socket\n",
      times, failures, losses, empty_reads, socket.looks());
  return failures == 0 && losses == 0 && times > 0 && empty_reads > 0 && socket.looks() > 0 ? EXIT_SUCCESS
                                                                                            : EXIT_FAILURE;
}

}  // namespace
}  // namespace tendril::test

int main(int argc, char** argv) {
  const QApplication application(argc, argv);
  QCommandLineParser parser;
  parser.addHelpOption();
  const QCommandLineOption times(QStringLiteral("times"),
                                 QStringLiteral("How many sends and gets; 500 by default."),
                                 QStringLiteral("N"), QStringLiteral("500"));
  parser.addOption(times);
  parser.process(application);
  try {
    return tendril::test::Run(parser.value(times).toInt());
  } catch (const std::exception& fault) {
    std::printf("%s\n", fault.what());
    return EXIT_FAILURE;
  }
}
