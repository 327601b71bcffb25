#include "ctl/port_opening.h"

#include <vector>

#include "ctl/bounded_wait.h"
#include "ctl/port_list.h"

namespace tendril::ctl {
namespace {

constexpr std::int32_t kNetworkBaudRate = 19200;
// The Control Panel may answer before it has closed the port.
constexpr int kOpeningTries = 30;
constexpr std::int32_t kTryAgainMs = 100;

Report Failure(const std::string& sentence, int exit_code = kExitPort) {
  return {.exit_code = exit_code, .problem = QString::fromStdString(sentence)};
}

std::string NoSuchPort(std::int16_t number, const std::vector<std::int16_t>& others) {
  if (others.empty()) return "There is no " + CommName(number) + ", nor any other port: plug in the adapter.";
  return "There is no " + CommName(number) + "; there " + (others.size() == 1 ? "is " : "are ") +
         PortNames(others, "and") + ".";
}

// The device's own description, without where it was passed on.
std::string FirstLine(const std::string& description) {
  return description.substr(0, description.find("\r\n"));
}

}  // namespace

PortOpening::PortOpening(const CommandLine& line, Environment& environment, UnitSession& units)
    : line_(line), environment_(environment), units_(units), borrowed_(environment) {}

std::optional<Report> PortOpening::Open() {
  return OpenBy([this] {
    HwSerial& link = units_.Link();
    try {
      link.SetCommPort(number_);
      link.SetBaudRate(kNetworkBaudRate);
      link.SetPortOpen(true);
      link.SetRTS(true);
    } catch (...) {
      throw RuntimeError(CurrentFault().number(), units_.Trace().PortFault());
    }
  });
}

std::optional<Report> PortOpening::OpenToListen() {
  return OpenBy([this] {
    environment_.device.Open(number_, kNetworkBaudRate);
    environment_.device.SetRts(false);
  });
}

QString PortOpening::GiveBack() {
  units_.Link().SetPortOpen(false);
  if (borrowed_.GiveBack()) return {};
  return QStringLiteral("%1 is not given back: the Control Panel does not answer. Restart it.")
      .arg(QString::fromStdString(CommName(number_)));
}

std::optional<Report> PortOpening::OpenBy(const Opener& open) {
  if (auto problem = Choose()) return problem;
  environment_.stop.Watch();
  const auto fault = Try(open);
  if (!fault) return std::nullopt;
  const bool in_use = fault->number() == kErrPortAlreadyOpen;
  if (in_use && line_.take_port && borrowed_.ControlPanelRunning()) return Borrow(open);
  return Failure(Sentence(*fault));
}

std::optional<Report> PortOpening::Choose() {
  number_ = line_.port;
  if (number_ != 0) return std::nullopt;
  const std::vector<std::int16_t> ports = ListedPorts(environment_.device);
  if (ports.empty()) return Failure("There is no serial port: plug in the adapter.");
  if (ports.size() > 1) {
    return Failure(
        "Choose " + PortNames(ports, "or") + " with --port; tendril-ctl ports shows which is which.",
        kExitUsage);
  }
  number_ = ports.front();
  return std::nullopt;
}

std::optional<Report> PortOpening::Borrow(const Opener& open) {
  const std::string port = CommName(number_);
  if (!line_.quiet) {
    environment_.terminal.PrintError("Asking the Control Panel for " + QByteArray::fromStdString(port) +
                                     ".\n");
  }
  const std::string refusal = borrowed_.Borrow(static_cast<std::uint8_t>(number_));
  std::string sentence = port + " is in use, and " + refusal + ".";
  if (environment_.stop.Made()) sentence = "Stopped while the Control Panel was asked for " + port + ".";
  if (refusal.empty()) {
    std::optional<RuntimeError> fault = Try(open);
    const auto in_use = [&fault] { return fault && fault->number() == kErrPortAlreadyOpen; };
    for (int tries = 1; in_use() && tries < kOpeningTries && !environment_.stop.Made(); ++tries) {
      WaitUntil(environment_, kTryAgainMs, [this] { return environment_.stop.Made(); });
      fault = Try(open);
    }
    if (!fault) return std::nullopt;
    sentence = "The Control Panel has given " + port + " up, and yet: " + Sentence(*fault);
  }
  const QString not_given_back = GiveBack();
  Report report = Failure(sentence);
  if (!not_given_back.isEmpty()) report.problem += u' ' + not_given_back;
  return report;
}

std::optional<RuntimeError> PortOpening::Try(const Opener& open) {
  try {
    open();
  } catch (...) {
    const RuntimeError fault = CurrentFault();
    units_.Link().SetPortOpen(false);
    return fault;
  }
  return std::nullopt;
}

std::string PortOpening::Sentence(const RuntimeError& fault) {
  switch (fault.number()) {
    case kErrPortAlreadyOpen:
      return InUse();
    case kErrNotAllowed:
      return FirstLine(fault.description());
    default:
      if (!environment_.device.Exists(number_)) return NoSuchPort(number_, ListedPorts(environment_.device));
      return CommName(number_) + " cannot be opened: " + FirstLine(fault.description());
  }
}

std::string PortOpening::InUse() {
  const PortHolder holder = environment_.device.Holder(number_);
  const std::string in_use = CommName(number_) + " is in use";
  if (borrowed_.ControlPanelRunning()) {
    const std::string by =
        holder.process == 0 ? "the Control Panel" : HolderName(holder) + ", and the Control Panel runs";
    return in_use + " by " + by + (line_.take_port ? "." : ": --take-port asks it for the port.");
  }
  const bool guess = holder.process == 0 && !holder.program.empty();
  const std::string by = guess ? ", perhaps by " + holder.program : " by " + HolderName(holder);
  if (line_.take_port) return in_use + by + "; the Control Panel, which --take-port asks, does not run.";
  // A modem manager has each new port open for some seconds.
  return in_use + by + (guess ? ": try again in a moment." : ": close it.");
}

}  // namespace tendril::ctl
