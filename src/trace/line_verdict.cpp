#include "trace/line_verdict.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "platform/hex_text.h"
#include "serial/packets.h"

namespace tendril {
namespace {

using Verdict = LineVerdict::Kind;

// As many in a row say how it is now, whatever was before.
constexpr std::size_t kMissesInARow = 3;
constexpr std::size_t kAnswersInARow = 10;

bool IsAnswer(PollOutcome outcome) {
  return outcome == PollOutcome::kAnswered || outcome == PollOutcome::kAnsweredInNoise ||
         outcome == PollOutcome::kNotAccepted;
}

// Whether each of the last polls of a unit was answered, since its first answer.
std::vector<bool> AnswersOf(std::uint8_t unit, const std::deque<PollSeen>& polls) {
  std::vector<bool> answers;
  for (const PollSeen& poll : polls) {
    const bool answered = IsAnswer(poll.outcome);
    if (poll.unit == unit && (answered || !answers.empty())) answers.push_back(answered);
  }
  return answers;
}

// The last poll; the one before it when a reply to that came too late: whether one to the last comes is not known yet.
const PollSeen& DecisivePoll(const std::deque<PollSeen>& polls) {
  const PollSeen& last = polls.back();
  if (polls.size() < 2 || IsAnswer(last.outcome)) return last;
  const PollSeen& before = polls[polls.size() - 2];
  return before.outcome == PollOutcome::kTooLate && before.unit == last.unit ? before : last;
}

bool EndsWith(const std::vector<bool>& answers, bool answered, std::size_t count) {
  return answers.size() >= count && std::all_of(answers.end() - static_cast<std::ptrdiff_t>(count),
                                                answers.end(), [=](bool each) { return each == answered; });
}

LineVerdict JudgeLastPoll(const PollSeen& poll, const std::string& unit) {
  switch (poll.outcome) {
    case PollOutcome::kAnswered:
      return {Verdict::kAnswers, unit + " answers."};
    case PollOutcome::kAnsweredInNoise:
      return {Verdict::kAnswersInNoise,
              unit + " answers, after bytes that belong to nothing: check the wiring and the adapter."};
    case PollOutcome::kNotAccepted:
      return {Verdict::kNotAccepted,
              unit +
                  " answers, but has not accepted what was sent. Send again; if that fails, too, the unit "
                  "or the line is faulty."};
    case PollOutcome::kSilence:
      return {
          Verdict::kSilence,
          "Nothing comes back, not even what the program sends: check the port, the adapter and its wire. "
          "Some adapters never return what is sent: then check the unit's power, its ID and the wiring."};
    case PollOutcome::kEchoOnly:
      return {Verdict::kEchoOnly, "Only what the program sends comes back. " + unit +
                                      " does not answer: check its power, its ID and the wiring."};
    case PollOutcome::kNoAnswer:
      return {Verdict::kNoAnswer,
              unit + " does not answer: check its power, its ID, the wiring and the adapter."};
    case PollOutcome::kTooLate:
      return {
          Verdict::kTooLate,
          unit + " answers, but too late: connect the adapter without a hub, and set its latency to 1 ms."};
    case PollOutcome::kEchoDamaged:
      return {Verdict::kEchoDamaged,
              "What the program sends comes back damaged: check the adapter, its wire and its driver."};
    case PollOutcome::kNoReply:
      return {Verdict::kNoReply,
              "Bytes come that make no reply: perhaps several units have the ID " + HexByte(poll.unit) +
                  ", or a unit has another speed, or the wiring picks up noise. Connect one unit alone."};
    case PollOutcome::kOtherAnswer:
      return {
          Verdict::kOtherAnswer,
          "An answer comes, but not the one to this question. Connect one unit alone, and check that it is "
          "a Tendril unit."};
    case PollOutcome::kOtherUnit:
      return {Verdict::kOtherUnit,
              "Another unit answers than the one that was asked: perhaps it answers too "
              "late. Connect one unit alone."};
  }
  return {};
}

// An ID without a unit is no fault while units are searched for. An adapter that fails in the middle is one.
std::optional<LineVerdict> JudgeSearch(const SearchSeen& search, PollOutcome last) {
  const bool adapter_fails = last == PollOutcome::kSilence || last == PollOutcome::kEchoDamaged;
  if (search.polled < 2 || adapter_fails) return std::nullopt;
  const std::string asked = std::to_string(search.polled) + " IDs were asked, and ";
  if (search.answered == 1) return LineVerdict{Verdict::kAnswers, asked + "one unit answers."};
  if (search.answered > 1)
    return LineVerdict{Verdict::kAnswers, asked + std::to_string(search.answered) + " units answer."};
  if (last == PollOutcome::kEchoOnly) {
    return LineVerdict{Verdict::kEchoOnly, "Only what the program sends comes back. " + asked +
                                               "no unit answers: check power and wiring."};
  }
  if (last == PollOutcome::kNoAnswer) {
    return LineVerdict{Verdict::kNoAnswer,
                       asked + "no unit answers: check power, the wiring and the adapter."};
  }
  return std::nullopt;
}

}  // namespace

LineVerdict JudgeLine(const LineTrace& trace) {
  switch (trace.Port()) {
    case PortSeen::kNeverOpened:
      return {Verdict::kNotOpened, "No port has been opened yet: choose a comm port."};
    case PortSeen::kOpenFailed:
      return {Verdict::kCannotOpen, "The port could not be opened: " + trace.PortFault()};
    case PortSeen::kClosed:
      return {Verdict::kClosed, "The port is closed. The next command opens it."};
    case PortSeen::kLost:
      return {Verdict::kPortGone, "The port went away: plug the adapter in again, and choose the port."};
    case PortSeen::kOpen:
      break;
  }
  if (trace.Polls().empty()) {
    return {Verdict::kNothingAsked,
            "The port is open. Nothing has been asked yet: read a unit, or find units."};
  }
  if (trace.SentSincePoll())
    return {Verdict::kNothingAsked, "What is sent now gets no answer. To check the line, read the unit."};
  const PollSeen& last = DecisivePoll(trace.Polls());
  if (auto verdict = JudgeSearch(trace.Search(), last.outcome)) return *verdict;
  const std::string unit = last.unit == kAllUnits ? "The unit" : "Unit " + HexByte(last.unit);
  const std::vector<bool> answers = AnswersOf(last.unit, trace.Polls());
  const auto missed = static_cast<std::size_t>(std::count(answers.begin(), answers.end(), false));
  const bool settled = EndsWith(answers, true, kAnswersInARow) || EndsWith(answers, false, kMissesInARow);
  const bool of_unit = last.outcome == PollOutcome::kAnswered || last.outcome == PollOutcome::kEchoOnly ||
                       last.outcome == PollOutcome::kNoAnswer || last.outcome == PollOutcome::kNoReply;
  if (missed == 0 || settled || !of_unit) return JudgeLastPoll(last, unit);
  return {Verdict::kAnswersSometimes, unit + " answers, but not always: " + std::to_string(missed) +
                                          " of the last " + std::to_string(answers.size()) +
                                          " polls brought no reply. Check the wiring and its power."};
}

}  // namespace tendril
