#include "app/paced_line.h"

#include <optional>
#include <string>
#include <thread>
#include <utility>

namespace tendril {
namespace {

// A timer counts whole milliseconds and may be late by one, so it is of use from two on. Shorter waits are at the
// descriptor, which wakes up within a tenth of a millisecond, and at once for new input.
constexpr std::uint64_t kFineWaitUs = 2000;

// A program that sends faster than the line is held up, as by any serial port, when this much waits.
constexpr std::size_t kQueueLimit = 4096;

}  // namespace

PacedLine::PacedLine(const PseudoTerminal& terminal, VirtualLine& line, Console& console, bool show_bytes)
    : terminal_(terminal),
      line_(line),
      console_(console),
      printer_([this](const std::string& text) { console_.Print(text); }),
      program_baud_(line.options().baud),
      input_(terminal.input_descriptor(), QSocketNotifier::Read) {
  if (show_bytes) line_.SetTap([this](const LineByte& byte) { printer_.Note(byte); });
  line_.SetProgramHandler([this](std::uint8_t byte, std::uint64_t /*at_us*/) {
    if (!program_heard_) return;
    const bool taken = terminal_.Write({&byte, 1});
    if (!taken && program_reads_) console_.Print("-- The program does not read: bytes to it are lost.");
    program_reads_ = taken;
  });
  timer_.setTimerType(Qt::PreciseTimer);
  timer_.setSingleShot(true);
  QObject::connect(&timer_, &QTimer::timeout, &timer_, [this] { Step(); });
  QObject::connect(&input_, &QSocketNotifier::activated, &timer_, [this] {
    TakeInput();
    Step();
  });
  if (terminal_.closing_descriptor() < 0) return;
  closings_ = std::make_unique<QSocketNotifier>(terminal_.closing_descriptor(), QSocketNotifier::Read);
  QObject::connect(closings_.get(), &QSocketNotifier::activated, &timer_, [this] { OnClosing(); });
}

std::uint64_t PacedLine::NowUs() const {
  const auto elapsed = std::chrono::steady_clock::now() - start_;
  return static_cast<std::uint64_t>(std::chrono::duration_cast<std::chrono::microseconds>(elapsed).count());
}

// Serves the line once and sets the timer for the next time. A line that is never silent still returns to the event
// loop after every byte.
void PacedLine::Step() {
  line_.AdvanceTo(NowUs());
  std::optional<std::uint64_t> next_us = line_.NextEventUs();
  std::uint64_t now_us = NowUs();
  if (next_us && *next_us > now_us && *next_us - now_us <= kFineWaitUs) {
    const std::chrono::microseconds wait(*next_us - now_us);
    if (HasRoom()) {
      terminal_.WaitForInput(wait);
    } else {
      std::this_thread::sleep_for(wait);
    }
    line_.AdvanceTo(NowUs());
    TakeInput();
    next_us = line_.NextEventUs();
    now_us = NowUs();
  }
  if (next_us) {
    const std::uint64_t wait_us = *next_us > now_us ? *next_us - now_us : 0;
    timer_.start(wait_us > kFineWaitUs ? static_cast<int>(wait_us / 1000 - 1) : 0);
  } else {
    timer_.stop();
    printer_.Flush();
  }
  input_.setEnabled(HasRoom());
  console_.Flush();
}

bool PacedLine::HasRoom() { return line_.PendingFromProgram(NowUs()) < kQueueLimit; }

void PacedLine::TakeInput() {
  if (!HasRoom()) return;
  const Bytes bytes = terminal_.Read();
  if (bytes.empty()) return;
  program_heard_ = true;
  FollowSpeed();
  line_.ProgramWrites(bytes, NowUs());
}

void PacedLine::FollowSpeed() {
  const std::uint32_t baud = terminal_.ProgramBaud();
  if (baud == program_baud_ || baud == 0) return;
  program_baud_ = baud;
  line_.SetProgramBaud(baud, NowUs());
  console_.Print("-- The program has set " + std::to_string(baud) +
                 (baud == line_.options().baud ? " baud." : " baud: the units do not understand that."));
}

// What the program had sent still crosses the line, as it would from any serial port. What comes back is
// dropped: it is not for the next program.
void PacedLine::OnClosing() {
  TakeInput();
  if (terminal_.ProgramHasGone()) {
    program_reads_ = true;
    if (std::exchange(program_heard_, false)) console_.Print("-- The program has closed the device.");
  }
  Step();
}

}  // namespace tendril
