// unplug_trial [--times N] [--seed S]: the program, window and all, on a pseudo-terminal whose far end is killed at random
// moments of everything that uses the line, as when an adapter is pulled out. Each time the program must report it once,
// close the port, and work when the device is there again. The seed decides the moments; the machine's load does not repeat.
#include <unistd.h>

#include <QApplication>
#include <QCheckBox>
#include <QCommandLineParser>
#include <QRegularExpression>
#include <QSlider>
#include <algorithm>
#include <array>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <iterator>
#include <optional>
#include <random>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "app/utility_program.h"
#include "platform/wait_for.h"
#include "support/bench_process.h"
#include "support/user.h"

namespace tendril::test {
namespace {

constexpr char kFailed[] = "COMMAND FAILED!";
constexpr char kSent[] = "SUCCESS: Send Complete!";
constexpr char kGot[] = "SUCCESS: Upload Complete";

// The boxes, title and text, as regular expressions. "@" is the fault of opening a port that has gone.
constexpr char kGone[] =
    "Open of serial port 1 has failed\n\nError: \\(8002\\) There is no serial device (for Comm 1|at "
    "\\S+)\\.\n"
    "While: Executing Port Open Property";
constexpr char kAtPollOfSend[] = "Serial Event Error: Serial Event Error \\(Poll Type 48\\)\n\n@";
constexpr char kAtPollOfGet[] = "Serial Event Error: Serial Event Error \\(Poll Type 110\\)\n\n@";
constexpr char kAtNextPort[] = "Comm Error!: Download Failed\n@\nTrace: Fade";
constexpr char kAtChange[] = "Comm Error!: @(\nTrace: SetAddress)?";
constexpr char kAtMovement[] = "Comm Error!: @\nTrace: Fade";
// From a unit that has just started and has accepted nothing yet.
constexpr char kNothingNew[] = "No Repsonse: Unit did not respond to the Option Settings, Retry Command";

// What runs when the adapter is pulled out.
struct Kind {
  const char* name;
  const char* button;   // pressed at the start; null for none
  const char* success;  // outcome of a command; null for what is no command
  int rest_ms;          // a command that has all replies when the line dies can succeed so much later
  std::vector<const char*> boxes;  // with a failure, one of these
  bool moves_slider = false;
  bool back_soon = false;
};
const std::array<Kind, 8> kKinds{
    {{"send", kSend, kSent, 300, {kAtPollOfSend, kAtNextPort}},
     {"get", kGet, kGot, 0, {kAtPollOfGet}},
     {"change of ID", kChangeId, "SUCCESS: UnitID set to '01'", 200, {kAtChange}},
     {"sweep", kSweep, nullptr, 0, {}},
     {"slider", nullptr, nullptr, 0, {kAtMovement}, true},
     {"idle", nullptr, nullptr, 0, {}},
     {"send, back soon", kSend, kSent, 0, {kAtPollOfSend, kAtNextPort, kNothingNew}, false, true},
     {"get, back soon", kGet, kGot, 0, {kAtPollOfGet}, false, true}}};

constexpr double kMaxReportMs = 1000;  // from the unplugging until the user has the report
constexpr int kMaxBackMs = 200;        // what is back soon is back within this

// Also that of a device that is gone.
bool Holds(const std::string& device) {
  std::error_code closed_meanwhile;
  for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
    if (std::filesystem::read_symlink(entry, closed_meanwhile).string().starts_with(device)) return true;
  }
  return false;
}

class Trial {
 public:
  Trial() {
    bench_.Start(kUnits);
    program_.emplace();
    program_->window.show();
    user_.SetWindow(program_->window);
    user_.ChoosePort(1);
    QTest::mouseClick(&user_.Find("ServoSimulator2_0"), Qt::LeftButton);
    durations_.fill(Ms(800));  // of what has no end
    for (std::size_t kind = 0; kind < kKinds.size(); ++kind) {
      if (kKinds[kind].success == nullptr) continue;
      const Clock::time_point begin = Clock::now();
      Command(kKinds[kind]);
      durations_[kind] = (Clock::now() - begin) * 1.05;  // sometimes just after the end
    }
    if (!wrong_.empty()) throw std::runtime_error("Fails before it is unplugged: " + wrong_);
  }

  // Unplugs once; false when something was wrong.
  bool Unplug(std::uint64_t seed) {
    const std::size_t index = seed % kKinds.size();
    const Kind& kind = kKinds[index];
    std::mt19937_64 random(seed);
    const Ms moment = durations_[index] * std::uniform_real_distribution(0.0, 1.0)(random);
    const int back_ms = std::uniform_int_distribution(0, kMaxBackMs)(random);
    wrong_.clear();
    user_.read.clear();
    user_.OutcomeLabel().clear();
    const std::string device = std::filesystem::read_symlink(bench_.Link().toStdString());

    Operate(kind, moment, back_ms);
    Judge(kind);
    if (!kind.back_soon) Expect(!program_->Serial1.PortOpen() && !Holds(device), "the port is open");
    Recover(kind);
    if (wrong_.empty()) return true;
    std::printf("FAILED %s, after %.2f ms: %s\n  scripts/unplug --times 1 --seed %llu\n", kind.name,
                moment.count(), wrong_.c_str(), static_cast<unsigned long long>(seed));
    return false;
  }

 private:
  using Clock = std::chrono::steady_clock;
  using Ms = std::chrono::duration<double, std::milli>;
  // It answers at FF as well.
  static inline const QStringList kUnits{QStringLiteral("--unit"), QStringLiteral("01")};

  void Expect(bool right, const std::string& wrong) {
    if (!right) wrong_ += (wrong_.empty() ? "" : "; ") + wrong;
  }
  std::string Outcome() const { return user_.OutcomeLabel().text().toStdString(); }

  // Does what `kind` says and kills the bench meanwhile, from another thread: the program may be in the middle of
  // anything. Goes on until the report should be complete.
  void Operate(const Kind& kind, Ms moment, int back_ms) {
    std::atomic<bool> killed = false;
    const std::jthread killer([&, bench = static_cast<pid_t>(bench_.ProcessId())] {
      std::this_thread::sleep_for(moment);
      killed_at_ = Clock::now();
      ::kill(bench, SIGKILL);
      killed = true;
    });
    if (kind.button != nullptr) user_.Press(kind.button);
    QTimer mover;
    int step = 0;
    QObject::connect(&mover, &QTimer::timeout, &mover, [&] {
      if (QApplication::activeModalWidget() != nullptr) return;  // the box is in the way
      QTest::keyClick(&user_.Find<QSlider>("HScrollSendServoPosition"),
                      ++step / 20 % 2 == 0 ? Qt::Key_Right : Qt::Key_Left);
    });
    if (kind.moves_slider) {
      user_.Find<QCheckBox>("chkSendSlideCommands").setChecked(true);
      mover.start(8);
    }
    WaitFor([&] { return killed.load(); });
    bench_.Kill();
    if (kind.back_soon) {
      RunFor(back_ms);
      bench_.Start(kUnits);
    }
    WaitFor([&] {
      if (kind.moves_slider) return !user_.read.empty();
      return kind.success == nullptr ||
             (user_.CommandOver() && (Outcome() == kind.success || !user_.read.empty()));
    });
    report_at_ = Clock::now();
    if (!kind.back_soon) WaitFor([this] { return !program_->Serial1.PortOpen(); });
    RunFor(300);  // for a second report
  }

  void Judge(const Kind& kind) {
    const std::string outcome = Outcome();
    const bool success = kind.success != nullptr && outcome == kind.success;
    const bool failure = kind.moves_slider || (kind.success != nullptr && outcome == kFailed);
    Expect(success || failure || (kind.success == nullptr && outcome.empty()), "outcome \"" + outcome + "\"");
    Expect(user_.read.size() == (failure ? 1 : 0), std::to_string(user_.read.size()) + " boxes");
    for (const auto& [title, text] : user_.read) {
      const QString box = QString::fromStdString(title + ": " + text);
      const bool due = std::any_of(kind.boxes.begin(), kind.boxes.end(), [&](const char* pattern) {
        const QString whole = QString::fromLatin1(pattern).replace(QLatin1Char('@'), QLatin1String(kGone));
        return QRegularExpression(QRegularExpression::anchoredPattern(whole)).match(box).hasMatch();
      });
      Expect(due, "unexpected box: " + box.toStdString());
    }
    // Without the line a command succeeds only by the replies that it had already.
    const double took_ms = Ms(report_at_ - killed_at_).count();
    if (success && !kind.back_soon) Expect(took_ms <= kind.rest_ms + 50, "succeeded without a line");
    if (failure) {
      Expect(took_ms <= kMaxReportMs + (kind.back_soon ? kMaxBackMs : 0), "reported late");
    }
    Expect(user_.Button(kSweep).text() == QStringLiteral("Test"), "the sweep goes on");
    Expect(!user_.Find<QCheckBox>("chkSendSlideCommands").isChecked(), "the slider goes on");
  }

  // Plugs it in again, and does what a user does then.
  void Recover(const Kind& kind) {
    auto& box = user_.Find<QCheckBox>("chkSendSlideCommands");
    for (const bool checked : {true, false}) {
      QTest::mouseClick(&box, Qt::LeftButton, {}, {8, box.height() / 2});
      Expect(box.isChecked() == checked, "the window does not respond");
    }
    if (!kind.back_soon) bench_.Start(kUnits);
    user_.read.clear();
    user_.ChoosePort(1);
    Command(kind.success != nullptr ? kind : kKinds[1]);
    Expect(program_->Serial1.PortOpen(), "the port is closed");
  }

  void Command(const Kind& kind) {
    user_.Press(kind.button);
    WaitFor([this] { return user_.CommandOver(); });
    Expect(Outcome() == kind.success, "not " + std::string(kind.success));
    for (const auto& [title, text] : user_.read) Expect(false, title + ": " + text);
  }

  BenchProcess bench_;
  std::optional<UtilityProgram> program_;
  User user_;
  std::array<Ms, kKinds.size()> durations_;  // without unplugging
  Clock::time_point killed_at_, report_at_;  // this round
  std::string wrong_;                        // this round
};

std::ptrdiff_t OpenDescriptors() {
  return std::distance(std::filesystem::directory_iterator("/proc/self/fd"),
                       std::filesystem::directory_iterator());
}

int Run(const QApplication& application) {
  QCommandLineParser parser;
  parser.addHelpOption();
  const QCommandLineOption times(QStringLiteral("times"),
                                 QStringLiteral("How often to unplug; 200 by default."), QStringLiteral("N"),
                                 QStringLiteral("200"));
  const QCommandLineOption seed(QStringLiteral("seed"),
                                QStringLiteral("The seed of the first time; each has the next."),
                                QStringLiteral("S"), QString::number(std::random_device()()));
  parser.addOptions({times, seed});
  parser.process(application);
  const std::uint64_t first = parser.value(seed).toULongLong();
  const int rounds = parser.value(times).toInt();
  std::printf("seed %llu\n", static_cast<unsigned long long>(first));
  Trial trial;
  int failures = 0;
  std::ptrdiff_t descriptors = 0;
  for (int round = 0; round < rounds; ++round) {
    failures += trial.Unplug(first + static_cast<std::uint64_t>(round)) ? 0 : 1;
    std::fflush(stdout);
    if (round == static_cast<int>(kKinds.size())) descriptors = OpenDescriptors();
  }
  if (rounds > static_cast<int>(kKinds.size()) && OpenDescriptors() > descriptors) {
    ++failures;
    std::printf("%td file descriptors after each kind was unplugged once, %td at the end\n", descriptors,
                OpenDescriptors());
  }
  std::printf("%d times unplugged, %d failures\n", rounds, failures);
  return failures == 0 && rounds > 0 ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace
}  // namespace tendril::test

int main(int argc, char** argv) {
  const QApplication application(argc, argv);
  try {
    return tendril::test::Run(application);
  } catch (const std::exception& fault) {
    std::printf("%s\n", fault.what());
    return EXIT_FAILURE;
  }
}
