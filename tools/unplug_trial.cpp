// unplug_trial [--times N] [--seed S]: the program, window and all, on a pseudo-terminal whose far end is killed at
// random moments of everything that uses the line, as when an adapter is pulled out. Each time it looks for what the
// person is told, and whether the program still works and holds on to nothing. Takes some minutes. The moments are
// those of the seed; what the machine does just then is not.
#include <unistd.h>

#include <QApplication>
#include <QCheckBox>
#include <QCommandLineParser>
#include <QElapsedTimer>
#include <QRegularExpression>
#include <QSlider>
#include <algorithm>
#include <array>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <map>
#include <optional>
#include <random>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "app/utility_program.h"
#include "platform/wait_for.h"
#include "support/bench_process.h"
#include "support/process_figures.h"
#include "support/user.h"

namespace tendril::test {
namespace {

constexpr char kFailed[] = "COMMAND FAILED!";
constexpr char kSent[] = "SUCCESS: Send Complete!";
constexpr char kGot[] = "SUCCESS: Upload Complete";

// The boxes, title and text, as regular expressions. "@" is what a port that has gone says when it is opened; the
// device may still be seen to go then.
constexpr char kGone[] =
    "Open of serial port 1 has failed\n\nError: \\(8002\\) There is no serial device (for Comm 1|at "
    "\\S+)\\.\n"
    "While: Executing Port Open Property";
constexpr char kAtPollOfSend[] = "Serial Event Error: Serial Event Error \\(Poll Type 48\\)\n\n@";
constexpr char kAtPollOfGet[] = "Serial Event Error: Serial Event Error \\(Poll Type 110\\)\n\n@";
constexpr char kAtNextPort[] = "Comm Error!: Download Failed\n@\nTrace: Fade";
constexpr char kAtChange[] = "Comm Error!: @(\nTrace: SetAddress)?";
constexpr char kAtMovement[] = "Comm Error!: @\nTrace: Fade";
// From a unit that has come up just now and was sent nothing yet.
constexpr char kNothingNew[] = "No Repsonse: Unit did not respond to the Option Settings, Retry Command";

// What goes on when the adapter is pulled out.
struct Kind {
  const char* name;
  const char* button;   // pressed at the start; null for none
  const char* success;  // what a command ends with when all goes well; null for what is no command
  int rest_ms;  // a command that has everything from the unit when the line dies ends well so much later
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

// The rounds before this one fill what is filled once: fonts, pictures of controls, boxes.
constexpr int kWarm = 20;
constexpr double kMaxHeapGrowth = 100;      // bytes a round; a timer forgotten at each opening is 200
constexpr double kMaxResidentGrowth = 2e6;  // bytes in all: holes in the heap, and code that runs late
constexpr double kMaxUnpluggedCpu = 1;      // percent of a core, with the attempts to reach a comm listener
constexpr qint64 kMaxStallMs = 400;         // of the event loop, on a machine that does other things too
constexpr double kMaxToldMs = 1000;         // from the unplugging until the person has been told
constexpr int kMaxBackMs = 200;             // what is back soon is back within this

class Trial {
 public:
  explicit Trial(int rounds) {
    held_.reserve(static_cast<std::size_t>(rounds));
    bench_.Start(kUnits);
    program_.emplace();
    program_->window.show();
    user_.SetWindow(program_->window);
    user_.ChoosePort(1);
    QTest::mouseClick(&user_.Find<QWidget>("ServoSimulator2_0"), Qt::LeftButton);
    // Notes each outcome and takes it away, so that the next one shows even if it is the same.
    QObject::connect(&watch_, &QTimer::timeout, &watch_, [this] {
      longest_stall_ms_ = std::max(longest_stall_ms_, since_look_.restart());
      QLabel& label = user_.OutcomeLabel();
      if (label.text().isEmpty()) return;
      outcomes_.push_back(label.text().toStdString());
      outcome_at_ = Clock::now();
      label.clear();
    });
    Watch(true);
    lasts_.fill(Ms(800));  // what has no end
    for (std::size_t kind = 0; kind < kKinds.size(); ++kind) {
      if (kKinds[kind].success == nullptr) continue;
      const Clock::time_point begin = Clock::now();
      Command(kKinds[kind]);
      lasts_[kind] = (Clock::now() - begin) * 1.05;  // now and then just after the end
    }
    if (!wrong_.empty()) throw std::runtime_error("it does not work to begin with: " + wrong_);
  }

  // Unplugs once; false when something was not as it should be.
  bool Unplug(std::uint64_t seed) {
    const std::size_t index = seed % kKinds.size();
    const Kind& kind = kKinds[index];
    std::mt19937_64 random(seed);
    const Ms moment = lasts_[index] * std::uniform_real_distribution(0.0, 1.0)(random);
    const int back_ms = std::uniform_int_distribution(0, kMaxBackMs)(random);
    wrong_.clear();
    user_.read.clear();
    outcomes_.clear();
    longest_stall_ms_ = 0;
    const std::filesystem::path device = std::filesystem::read_symlink(bench_.Link().toStdString());

    Operate(kind, moment, back_ms);
    Judge(kind, rows_[index]);
    if (!kind.back_soon) {
      Expect(!program_->Serial1.PortOpen() && !Holds(device), "the port is open");
      if (kind.button == nullptr && !kind.moves_slider) {
        Watch(false);
        idle_cpu_ += CpuPercentWhileIdle(1000);
        ++idle_seconds_;
        Watch(true);
      }
    }
    Recover(kind);
    Expect(longest_stall_ms_ <= kMaxStallMs, "stood still for " + std::to_string(longest_stall_ms_) + " ms");
    held_.push_back(WhatIsHeld());
    if (wrong_.empty()) return true;
    std::printf("FAILED %s, after %.2f ms: %s\n  scripts/unplug --times 1 --seed %llu\n", kind.name,
                moment.count(), wrong_.c_str(), static_cast<unsigned long long>(seed));
    return false;
  }

  // Prints what was seen; the number of things that the program holds or uses too much of.
  int Report() const {
    std::printf("\n%-16s %6s %8s %7s %7s %12s\n", "unplugged in", "rounds", "success", "failed", "silent",
                "told within");
    for (std::size_t kind = 0; kind < kKinds.size(); ++kind) {
      const Row& row = rows_[kind];
      std::printf("%-16s %6d %8d %7d %7d %9.0f ms\n", kKinds[kind].name,
                  row.success + row.failed + row.silent, row.success, row.failed, row.silent, row.slowest_ms);
    }
    for (const auto& [text, times] : texts_) std::printf("%4d times: %s\n", times, text.c_str());
    int wrong = 0;
    const auto judge = [&wrong](bool right) { return right ? "" : (++wrong, "  <-- TOO MUCH"); };
    const double cpu = idle_seconds_ > 0 ? idle_cpu_ / idle_seconds_ : 0;
    std::printf("unplugged and idle for %d s: %.2f %% of a core, at most %.0f%s\n", idle_seconds_, cpu,
                kMaxUnpluggedCpu, judge(cpu <= kMaxUnpluggedCpu));
    const int rounds = static_cast<int>(held_.size());
    if (rounds < 2 * kWarm) {
      std::printf("too few rounds to judge what is held\n");
      return wrong;
    }
    // The least of ten rounds: what is never given back lifts that too, what comes and goes does not.
    const auto least = [this](int from, double Held::*what) {
      const auto begin = held_.begin() + from;
      const auto less = [what](const Held& a, const Held& b) { return a.*what < b.*what; };
      return (*std::min_element(begin, begin + 10, less)).*what;
    };
    const auto compare = [&](const char* name, double Held::*what, double growth) {
      const double first = least(kWarm, what), last = least(rounds - 10, what);
      std::printf("%-12s after round %d: %.0f, after the last: %.0f, at most %.0f%s\n", name, kWarm, first,
                  last, first + growth, judge(last <= first + growth));
    };
    compare("descriptors", &Held::descriptors, 0);
    compare("heap", &Held::heap, kMaxHeapGrowth * (rounds - kWarm));
    compare("resident", &Held::resident, kMaxResidentGrowth);
    return wrong;
  }

 private:
  using Clock = std::chrono::steady_clock;
  using Ms = std::chrono::duration<double, std::milli>;
  struct Row {
    int success = 0, failed = 0, silent = 0;
    double slowest_ms = 0;
  };
  // It answers at FF as well.
  static inline const QStringList kUnits{QStringLiteral("--unit"), QStringLiteral("01")};

  void Expect(bool right, const std::string& wrong) {
    if (!right) wrong_ += (wrong_.empty() ? "" : "; ") + wrong;
  }
  void Watch(bool on) {
    since_look_.start();
    on ? watch_.start(2) : watch_.stop();
    user_.Rest(!on);
  }
  static QString Words(const User::Box& box) { return QString::fromStdString(box.first + ": " + box.second); }
  bool CommandOver() const { return !outcomes_.empty() && user_.Button(kSend).isEnabled(); }
  static bool Holds(const std::filesystem::path& device) {
    std::error_code closed_meanwhile;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd")) {
      const std::string open = std::filesystem::read_symlink(entry, closed_meanwhile).string();
      if (open == device || open == device.string() + " (deleted)") return true;
    }
    return false;
  }

  // Does what `kind` says and kills the bench meanwhile, from aside: the program may be in the middle of anything.
  // Goes on until everything should have been told.
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
             (CommandOver() && (outcomes_[0] == kind.success || !user_.read.empty()));
    });
    told_at_ = Clock::now();
    if (!kind.back_soon) WaitFor([this] { return !program_->Serial1.PortOpen(); });
    RunFor(300);  // for more to be told
  }

  void Judge(const Kind& kind, Row& row) {
    const bool success = kind.success != nullptr && outcomes_ == std::vector<std::string>{kind.success};
    const bool command_failed = kind.success != nullptr && outcomes_ == std::vector<std::string>{kFailed};
    const bool failure = command_failed || kind.moves_slider;
    ++(success ? row.success : failure ? row.failed : row.silent);
    Expect(success || command_failed || (kind.success == nullptr && outcomes_.empty()),
           "not the one outcome");
    Expect(user_.read.size() == (failure ? 1 : 0), std::to_string(user_.read.size()) + " boxes");
    for (const std::string& outcome : outcomes_) ++texts_[outcome];
    for (const User::Box& read : user_.read) {
      const QString box = Words(read);
      const bool due = std::any_of(kind.boxes.begin(), kind.boxes.end(), [&](const char* pattern) {
        const QString whole = QString::fromLatin1(pattern).replace(QLatin1Char('@'), QLatin1String(kGone));
        return QRegularExpression(QRegularExpression::anchoredPattern(whole)).match(box).hasMatch();
      });
      Expect(due, "not a box that is due: " + box.toStdString());
      ++texts_[QString(box).replace(QLatin1Char('\n'), QLatin1Char('|')).toStdString()];
    }
    // What was told has a reason: a failure needs the loss, and without the line a command ends well only by what
    // it had from the unit already.
    const double after_loss_ms = Ms(outcome_at_ - killed_at_).count();
    if (command_failed) Expect(after_loss_ms > 0, "failed before it was unplugged");
    if (success && !kind.back_soon) Expect(after_loss_ms <= kind.rest_ms + 50, "succeeded without a line");
    if (failure) {
      const double told_ms = Ms(told_at_ - killed_at_).count();
      row.slowest_ms = std::max(row.slowest_ms, told_ms);
      Expect(told_ms <= kMaxToldMs + (kind.back_soon ? kMaxBackMs : 0), "told late");
    }
    Expect(user_.Button(kSweep).text() == QStringLiteral("Test"), "the sweep goes on");
    Expect(!user_.Find<QCheckBox>("chkSendSlideCommands").isChecked(), "the slider goes on");
  }

  // Plugs it in again, and does what a person does then.
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
    outcomes_.clear();
    user_.Press(kind.button);
    WaitFor([this] { return CommandOver(); });
    Expect(outcomes_ == std::vector<std::string>{kind.success}, "not " + std::string(kind.success));
    for (const User::Box& read : user_.read) Expect(false, Words(read).toStdString());
  }

  BenchProcess bench_;
  std::optional<UtilityProgram> program_;
  User user_;
  QTimer watch_;
  QElapsedTimer since_look_;
  std::array<Ms, kKinds.size()> lasts_;  // when nobody pulls

  // This round.
  std::vector<std::string> outcomes_;
  Clock::time_point killed_at_, outcome_at_, told_at_;
  qint64 longest_stall_ms_ = 0;
  std::string wrong_;

  // All rounds.
  std::array<Row, kKinds.size()> rows_;
  std::map<std::string, int> texts_;
  std::vector<Held> held_;
  double idle_cpu_ = 0;
  int idle_seconds_ = 0;
};

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
  Trial trial(rounds);
  int failures = 0;
  for (int round = 0; round < rounds; ++round) {
    failures += trial.Unplug(first + static_cast<std::uint64_t>(round)) ? 0 : 1;
    std::fflush(stdout);
  }
  if (const int wrong = trial.Report(); wrong > 0) {
    failures += wrong;
    std::printf("  scripts/unplug --times %d --seed %llu\n", rounds, static_cast<unsigned long long>(first));
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
