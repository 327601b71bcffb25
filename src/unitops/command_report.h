// CommandReport: what the user learns when a unit command begins or ends.
#pragma once

#include <string>

namespace tendril {

struct CommandReport {
  std::string what;        // "Sending to unit 01"
  std::string outcome;     // how it ended ("COMMAND FAILED!"); empty: it has begun
  std::string aftermath;   // how it left the unit, or the configuration: a sentence
  bool cancelled = false;  // by the user: that is how it ended

  // "Sending to unit 01 at 14:05: COMMAND FAILED! Ports 1 to 3 are written, 4 perhaps, 5 to 8 are not."
  std::string Sentence(const std::string& time) const;
};

}  // namespace tendril
