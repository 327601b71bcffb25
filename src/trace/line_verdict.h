// LineVerdict: what the last polls say about the line, in one sentence with what to do.
#pragma once

#include <string>

#include "trace/line_trace.h"

namespace tendril {

struct LineVerdict {
  enum class Kind {
    kNotOpened,
    kCannotOpen,
    kClosed,
    kPortGone,
    kNothingAsked,
    kSilence,
    kEchoOnly,
    kNoAnswer,
    kTooLate,
    kEchoDamaged,
    kNoReply,
    kOtherAnswer,
    kOtherUnit,
    kNotAccepted,
    kAnswersInNoise,
    kAnswersSometimes,  // some of the last polls of this unit had a reply
    kAnswers
  };

  Kind kind;
  // For the user: "Unit 01 answers."
  std::string sentence;
};

// Judges by the port and by the last poll that has ended, and by those before it of the same unit.
LineVerdict JudgeLine(const LineTrace& trace);

// Whether the last poll brought bytes that make no reply, as when several units answer at once.
inline bool PerhapsSeveralUnits(const LineTrace& trace) {
  return !trace.Polls().empty() && trace.Polls().back().outcome == PollOutcome::kNoReply;
}

// Whether the reply to the last poll came from another unit.
inline bool AnotherUnitAnswered(const LineTrace& trace) {
  return !trace.Polls().empty() && trace.Polls().back().outcome == PollOutcome::kOtherUnit;
}

}  // namespace tendril
