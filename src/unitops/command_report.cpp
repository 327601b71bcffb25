#include "unitops/command_report.h"

namespace tendril {

std::string CommandReport::Sentence(const std::string& time) const {
  if (outcome.empty()) return what;
  return what + " at " + time + ": " + (cancelled ? "Cancelled: " : "") + outcome +
         (outcome.back() == '!' ? " " : ". ") + aftermath;
}

}  // namespace tendril
