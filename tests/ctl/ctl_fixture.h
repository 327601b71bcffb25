// CtlTest: the commands of tendril-ctl on a bench, in simulated time.
#pragma once

#include <gmock/gmock.h>

#include <QStringList>
#include <QTemporaryDir>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <variant>

#include "ctl/command_line.h"
#include "ctl/environment.h"
#include "ctl/program.h"
#include "support/simulated_control_panel.h"
#include "support/simulated_world.h"

namespace tendril::test {

// Keeps what is printed. No terminal, unless a test makes it one.
struct RecordedTerminal final : ctl::Terminal {
  QString Print(const QByteArray& text) override {
    out += WithSlashes(text);
    return {};
  }
  void PrintError(const QByteArray& text) override { error += WithSlashes(text); }
  int ErrorColumns() const override { return columns; }
  int OutputColumns() const override { return columns; }
  bool Colours() const override { return false; }
  std::optional<QString> Ask(const QByteArray& question) override {
    PrintError(question);
    if (asked) asked();
    return answer;
  }
  bool CanAsk() const override { return answer.has_value(); }

  // Paths have the separators of all other systems. A document of JSON stays as it is.
  static std::string WithSlashes(QByteArray text) {
#ifdef _WIN32
    if (!text.startsWith('{')) text.replace('\\', '/');
#endif
    return text.toStdString();
  }

  std::string out;
  std::string error;
  int columns = 0;
  std::optional<QString> answer;
  std::function<void()> asked;  // what the user does before the answer
};

// Comm 1 to 4 exist; no unit is on a line. The Control Panel holds no port of them until it is given one.
class CtlTest : public testing::Test, protected ctl::Waiting {
 protected:
  // Runs "tendril-ctl" with these arguments, on Comm 1 unless they name a port, and returns the exit code. What it
  // prints is in `terminal_`.
  int Run(QStringList arguments) {
    terminal_.out.clear();
    terminal_.error.clear();
    arguments.prepend(QStringLiteral("tendril-ctl"));
    const auto parsed = ctl::ParseCommandLine(arguments);
    if (const auto* end = std::get_if<ctl::EarlyEnd>(&parsed))
      return ctl::PrintEarlyEnd(*end, arguments.contains(QStringLiteral("--json")), terminal_);
    auto line = std::get<ctl::CommandLine>(parsed);
    if (line.port == 0) line.port = 1;
    return ctl::RunCommand(line, environment_);
  }
  // The same, with spaces between the arguments.
  int Run(const std::string& arguments) { return Run(QString::fromStdString(arguments).split(u' ')); }
  // Does `action` in `ms`, while a command runs.
  void In(std::int32_t ms, std::function<void()> action) {
    timer_ = world_.time.CreateTimer([this, action = std::move(action)] {
      timer_->SetEnabled(false);
      action();
    });
    timer_->SetInterval(ms);
    timer_->SetEnabled(true);
  }
  // The path of a file in the test's own folder.
  QString Path(const char* name) const { return folder_.filePath(QString::fromUtf8(name)); }

  void Until(const std::function<bool()>& done) override {
    constexpr std::uint64_t kLongestMs = 600'000;
    ASSERT_TRUE(world_.time.AdvanceUntil(done, kLongestMs));
  }

  QTemporaryDir folder_;
  SimulatedWorld world_{0xFFFFFC00};  // its clock wraps soon
  SimulatedControlPanel panel_{world_};
  ctl::StopRequest stop_;
  std::unique_ptr<Timer> timer_;
  RecordedTerminal terminal_;
  std::int64_t start_ms_ = 1'796'000'000'000;  // 2026-11-29T21:20:00Z
  ctl::Environment environment_{
      *world_.device,
      world_.time,
      world_.time,
      world_.log,
      panel_.wsCLI,
      panel_.registry,
      panel_.processes,
      *this,
      stop_,
      terminal_,
      [this] { return start_ms_ + static_cast<std::int64_t>(world_.time.ElapsedMs()); }};
};

}  // namespace tendril::test
