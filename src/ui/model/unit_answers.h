// UnitAnswers: which units have answered, and when.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <utility>

namespace tendril {

// Keeps the last poll of each unit on each port.
class UnitAnswers {
 public:
  // `unit` on comm port `port` was polled at `time` ("14:02"), and has replied or not.
  void Note(std::int16_t port, std::uint8_t unit, bool replied, const std::string& time);

  // Whether `unit` did not answer when it was polled last, or, before its first poll, when every unit was.
  bool Missing(std::int16_t port, std::uint8_t unit) const;

  // "Unit 01 answered at 14:02", "Unit 01: no answer at 14:02", "Unit 01: not asked yet".
  std::string Sentence(std::int16_t port, std::uint8_t unit) const;

 private:
  struct Poll {
    bool replied;
    std::string time;
  };
  std::map<std::pair<std::int16_t, std::uint8_t>, Poll> polls_;
};

}  // namespace tendril
