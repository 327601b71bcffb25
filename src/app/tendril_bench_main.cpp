// tendril-bench: virtual units on a pseudo-terminal, for trying tendril-utility without hardware.

#include <fcntl.h>
#include <unistd.h>
#ifdef __linux__
#include <sys/prctl.h>
#endif

#include <QCommandLineParser>
#include <QCoreApplication>
#include <QSocketNotifier>
#include <QTimer>
#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "app/pseudo_terminal.h"
#include "bench/faulty_units.h"
#include "bench/line_printer.h"
#include "bench/virtual_line.h"
#include "bench/virtual_unit.h"
#include "platform/posix/paths.h"

namespace tendril {
namespace {

constexpr int kExitUsage = 1;
constexpr int kExitSetup = 2;

// Standard output, written when the line has been served, because a slow reader holds a writer up.
class Console {
 public:
  void Print(const std::string& text) { waiting_ += text + "\n"; }
  void Flush() {
    if (waiting_.empty()) return;
    std::fwrite(waiting_.data(), 1, waiting_.size(), stdout);
    std::fflush(stdout);
    waiting_.clear();
  }

 private:
  std::string waiting_;
};

// Runs a line in real time on a pseudo-terminal. What the program at the near end sends is heard by the
// units, and what they say reaches it, each byte when it would come over a wire.
class PacedLine {
 public:
  // Terminal, line and console must outlive this object. Whether the bytes on the line are printed is
  // `show_bytes`.
  PacedLine(const PseudoTerminal& terminal, VirtualLine& line, Console& console, bool show_bytes);

 private:
  std::uint64_t NowUs() const;
  void Step();
  bool HasRoom();
  void TakeInput();
  void FollowSpeed();
  void OnClosing();

  const PseudoTerminal& terminal_;
  VirtualLine& line_;
  Console& console_;
  LinePrinter printer_;
  const std::chrono::steady_clock::time_point start_ = std::chrono::steady_clock::now();
  std::uint32_t program_baud_;  // as last noted
  bool program_reads_ = true;   // as last noted
  bool program_heard_ = false;  // since one was last seen to close the device
  QTimer timer_;
  QSocketNotifier input_;
  std::unique_ptr<QSocketNotifier> closings_;
};

// A timer counts whole milliseconds and may be late by one, so that it is of use from two on. Less than that
// is waited for at the descriptor, which wakes up within a tenth of a millisecond, and at once for new input.
constexpr std::uint64_t kFineWaitUs = 2000;

// A program that sends faster than the line goes is held up, as by any serial port, when this much waits.
constexpr std::size_t kQueueLimit = 4096;

// Stands for a speed that has no name. Any that the units do not run at will do.
constexpr std::uint32_t kUncommonBaud = 300;

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
    if (!taken && program_reads_) console_.Print("-- The program does not read: bytes to it get lost.");
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

// Serves the line once and sees to it that this happens again when it is time. A line that is never silent
// still leaves the event loop its turn after every byte.
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
  if (baud == program_baud_) return;
  program_baud_ = baud;
  line_.SetProgramBaud(baud != 0 ? baud : kUncommonBaud, NowUs());
  const std::string speed = baud != 0 ? std::to_string(baud) + " baud" : "an uncommon speed";
  console_.Print("-- The program has set " + speed +
                 (baud == line_.options().baud ? "." : ": the units do not understand that."));
}

// What the program had sent still crosses the line, as it would from any serial port. What comes back has
// nobody to read it, and is not kept for the next program.
void PacedLine::OnClosing() {
  TakeInput();
  if (terminal_.ProgramHasGone()) {
    program_reads_ = true;
    if (std::exchange(program_heard_, false)) console_.Print("-- The program has closed the device.");
  }
  Step();
}

// Ends the event loop when the process is told to end, so that everything is put away.
class QuitOnSignal {
 public:
  QuitOnSignal() {
    if (::pipe(pipe_) != 0) throw std::runtime_error("The system has no pipe to give.");
    notifier_ = std::make_unique<QSocketNotifier>(pipe_[0], QSocketNotifier::Read);
    QObject::connect(notifier_.get(), &QSocketNotifier::activated, QCoreApplication::instance(),
                     [] { QCoreApplication::quit(); });
    struct sigaction action = {};
    action.sa_handler = [](int) {
      const char wake = 0;
      (void)!::write(pipe_[1], &wake, 1);
    };
    for (const int signal : {SIGINT, SIGTERM, SIGHUP}) ::sigaction(signal, &action, nullptr);
    std::signal(SIGPIPE, SIG_IGN);  // nobody reads what is printed: go on
  }

 private:
  static inline int pipe_[2] = {-1, -1};  // a signal handler reaches nothing else
  std::unique_ptr<QSocketNotifier> notifier_;
};

struct BenchUnit {
  std::uint8_t id = 0;
  const FaultKind* fault = nullptr;  // null: a well-behaved unit
};

struct BenchOptions {
  std::vector<BenchUnit> units;
  std::filesystem::path link;
  bool echo = true;
  bool quiet = false;
};

QString ListOfFaults() {
  QString list;
  for (const FaultKind& kind : FaultKinds()) {
    list += QStringLiteral("\n  %1 %2")
                .arg(QString::fromLatin1(kind.name.data(), qsizetype(kind.name.size())), -14)
                .arg(QString::fromLatin1(kind.description.data(), qsizetype(kind.description.size())));
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

// Ends the process for --help, --version and unknown options. Raises std::invalid_argument for values that
// make no sense.
BenchOptions ParseOptions(const QCoreApplication& application) {
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
  const QCommandLineOption quiet(text("quiet"), text("Do not print what crosses the line."));
  QCommandLineParser parser;
  parser.setApplicationDescription(
      text("Virtual units on a serial line of 19200 baud, for trying tendril-utility without hardware. The "
           "line is\n"
           "a pseudo-terminal; its link makes it a comm port of the utility.\n\nFaults:") +
      ListOfFaults() +
      text("\n\nEnds with 0 when it is stopped, with 1 for options that make no sense, and with 2 when the "
           "device\n"
           "or its link cannot be made."));
  parser.addHelpOption();
  parser.addVersionOption();
  parser.addOptions({unit, fault, link, no_echo, quiet});
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
  return options;
}

void Introduce(Console& console, const BenchOptions& options, const PseudoTerminal& terminal,
               const DeviceLink& link) {
  const std::string name = options.link.filename().string();
  const bool is_port = name.starts_with("com") && options.link.parent_path() == ConfigFolder() / "ports";
  console.Print("Tendril bench: virtual units on a serial line, 19200 baud, 8-N-1, " +
                std::string(options.echo ? "with echo" : "without echo"));
  console.Print("  device  " + terminal.device());
  console.Print("  link    " + options.link.string() + (is_port ? "  (Comm " + name.substr(3) + ")" : ""));
  if (!link.replaced().empty())
    console.Print("          which pointed to " + link.replaced().string() + " before");
  for (const BenchUnit& unit : options.units) {
    char id[3];
    std::snprintf(id, sizeof id, "%02X", unit.id);
    console.Print("  unit    " + std::string(id) +
                  (unit.fault == nullptr ? "" : "  " + std::string(unit.fault->description)));
  }
  console.Print("Choose the comm port and a unit's ID in tendril-utility. Ctrl+C ends the bench.");
  if (!options.quiet) console.Print("What crosses the line, with the time in seconds:");
  console.Flush();
}

int Run(QCoreApplication& application, const BenchOptions& options) {
#ifdef __linux__
  ::prctl(PR_SET_TIMERSLACK, 1'000);  // ns; by default waits are 50 us longer, a tenth of a byte
#endif
  const QuitOnSignal quit_on_signal;
  const PseudoTerminal terminal;
  const DeviceLink link(options.link, terminal.device());
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
  Introduce(console, options, terminal, link);
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
    return tendril::Run(application, tendril::ParseOptions(application));
  } catch (const std::invalid_argument& fault) {
    return tendril::Fail(tendril::kExitUsage, fault);
  } catch (const std::exception& fault) {
    return tendril::Fail(tendril::kExitSetup, fault);
  }
}
