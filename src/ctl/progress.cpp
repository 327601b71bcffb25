#include "ctl/progress.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

// Before that, what has passed says little about what is to come.
constexpr std::uint64_t kFirstEstimateMs = 2000;

}  // namespace

Progress::Progress(const CommandLine& line, Environment& environment)
    : environment_(environment),
      mode_(line.quiet                                               ? Mode::kSilent
            : environment.terminal.ErrorColumns() == 0 || line.trace ? Mode::kLines
                                                                     : Mode::kRedrawn),
      last_ms_(environment.clock.NowMs()) {}

Progress::~Progress() {
  if (drawn_.isEmpty()) return;
  // All columns: the terminal itself writes "^C" behind the text.
  const int columns = std::max(environment_.terminal.ErrorColumns() - 1, 0);
  environment_.terminal.PrintError('\r' + QByteArray(columns, ' ') + '\r');
}

void Progress::Show(const QString& text, double part) {
  if (mode_ != Mode::kRedrawn) return;
  const QString left = TimeLeft(part);
  // Where not all has room, the step counts less than the time.
  const bool fits = text.size() + left.size() < environment_.terminal.ErrorColumns();
  Draw(fits || left.isEmpty() ? text + left : text.section(u": "_s, 0, 0) + left);
}

void Progress::Note(const QString& text) {
  if (mode_ == Mode::kLines) environment_.terminal.PrintError(text.toUtf8() + '\n');
}

// ", 00:31 left"; empty while it is not known.
QString Progress::TimeLeft(double part) {
  const std::uint32_t now_ms = environment_.clock.NowMs();
  elapsed_ms_ += now_ms - std::exchange(last_ms_, now_ms);
  if (elapsed_ms_ < kFirstEstimateMs || part <= 0) return {};
  const auto seconds =
      static_cast<qint64>(std::ceil(static_cast<double>(elapsed_ms_) * (1 - part) / part / 1000));
  return u", %1:%2 left"_s.arg(seconds / 60, 2, 10, QChar(u'0')).arg(seconds % 60, 2, 10, QChar(u'0'));
}

// The terminal would begin a new line in its last column. What was longer is overwritten with spaces, which every
// terminal understands.
void Progress::Draw(const QString& text) {
  const QString line = text.left(std::max(environment_.terminal.ErrorColumns() - 1, 0));
  if (line == drawn_) return;
  environment_.terminal.PrintError('\r' + line.leftJustified(drawn_.size()).toUtf8());
  drawn_ = line;
}

}  // namespace tendril::ctl
