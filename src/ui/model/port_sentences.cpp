#include "ui/model/port_sentences.h"

namespace tendril {
namespace {

std::string WhoHasIt(const PortHolder& holder) {
  if (holder.program.empty()) return "another program has it";
  if (holder.process == 0) return "perhaps " + holder.program + " has it";
  return holder.program + " (process " + std::to_string(holder.process) + ") has it";
}

// For a port that the Control Panel has, or had until it was asked for it.
std::string ControlPanelHasIt(const PortFacts& facts) {
  switch (facts.requested == facts.chosen ? facts.request : PortControl::kNone) {
    case PortControl::kNone:
      return facts.holder.process == 0 ? "the Control Panel has it" : WhoHasIt(facts.holder);
    case PortControl::kAsked:
      return "the Control Panel is asked for it";
    case PortControl::kGranted:
      return "given up, Enter opens it";
    case PortControl::kRefused:
      return "the Control Panel keeps it";
    case PortControl::kUnanswered:
      return "the Control Panel is silent";
  }
  return {};
}

std::string WhyNotOpen(const PortFacts& facts) {
  switch (facts.fault) {
    case PortFault::kNone:
      return {};
    case PortFault::kInUse:
      return WhoHasIt(facts.holder);
    case PortFault::kControlPanelHasIt:
      return ControlPanelHasIt(facts);
    case PortFault::kNotAllowed:
      return "you are not allowed to use it";
    case PortFault::kGone:
      return "it was unplugged";
    case PortFault::kOther:
      return facts.reason;
  }
  return {};
}

}  // namespace

std::string PortSentence(const PortFacts& facts) {
  if (facts.chosen == 0) {
    if (facts.open != 0) return "No port chosen; " + CommName(facts.open) + " is still open";
    return facts.any_listed ? "No port chosen" : "No serial port found: plug in the adapter";
  }
  const std::string port = CommName(facts.chosen);
  if (facts.open == facts.chosen) return port + " open: " + facts.device;
  if (facts.back) return port + " is back: Enter opens it";
  const std::string why = WhyNotOpen(facts);
  return port + " is not open" + (why.empty() ? "" : ": " + why);
}

std::string BorrowedPortSentence(const PortFacts& facts) {
  const std::string port = CommName(facts.requested);
  switch (facts.request) {
    case PortControl::kNone:
      return {};
    case PortControl::kAsked:
      return "The Control Panel is asked for " + port + " and has not answered yet.";
    case PortControl::kGranted:
      return port +
             " is taken from the Control Panel: shows cannot use it. "
             "It goes back when this window is closed or another port is asked for.";
    case PortControl::kRefused:
      // Nothing is borrowed then.
      return facts.chosen == facts.requested
                 ? "The Control Panel refuses to give up " + port + ": shows go on using it."
                 : std::string();
    case PortControl::kUnanswered:
      return "The Control Panel was asked for " + port +
             " and does not answer: perhaps shows cannot use it. Choose it again.";
  }
  return {};
}

}  // namespace tendril
