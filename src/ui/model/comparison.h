// Comparison: what a unit held when it was read, beside the records of the moment.
#pragma once

#include <cstddef>
#include <optional>
#include <string>

#include "config/channel_config.h"
#include "config/option_bytes.h"
#include "config/option_differences.h"
#include "ui/model/unit_place.h"

namespace tendril {

// Keeps nothing of the records: each answer is about what they are now. A value is equal when a send would give the unit
// the bits that it held: 1505 and 1500 are one value in a unit. A record that cannot be sent is compared, too.
class Comparison {
 public:
  // `working` are the records; they must outlive this object. Nothing is compared yet.
  explicit Comparison(const ChannelTable& working) : working_(working) {}

  // The unit at `place` was read at `time` ("14:02"), and held this.
  void Begin(const UnitPlace& place, const OptionTable& held, const std::string& time);
  void End() { held_.reset(); }
  // Whether there is something to compare with.
  bool Any() const { return held_.has_value(); }
  // Of which unit; valid while there is something.
  const UnitPlace& Place() const { return place_; }

  // This unit is chosen now. What is said of another one names it.
  void Choose(const UnitPlace& chosen) { chosen_ = chosen; }
  // The unit at `place` was asked again, and could not be read, or the user has `cancelled` that.
  void ReadingFailed(const UnitPlace& place, bool cancelled);
  // Something is being written into the unit at `place`; FF is every unit on the port.
  void WritingBegins(const UnitPlace& place);

  // The number of values of `channel`, 0 to 7, that differ: the output kind, eight pulse widths and two options.
  int Count(std::size_t channel) const;
  // "here 1100, unit 1000"; empty while the part is equal.
  std::string InWords(std::size_t channel, ComparedPart part) const;
  // All that differs in `channel`, a line for each part: "Default position: here 1100, unit 1000".
  std::string InWords(std::size_t channel) const;
  // "Differs from unit 01: 2 values"; empty while the channel is equal.
  std::string ChannelSentence(std::size_t channel) const;
  // "Unit 01 differs: 3 values of 2 channels", "Unit 01 holds exactly this"; empty while there is nothing.
  std::string Sentence() const;
  // "Unit 01 on Comm 1 was read at 14:02."
  std::string Reading() const;

 private:
  // The worse, the later.
  enum class Age { kFresh, kReadingCancelled, kReadingFailed, kSentSince };

  std::string UnitName() const;

  const ChannelTable& working_;
  std::optional<OptionTable> held_;
  UnitPlace place_;
  UnitPlace chosen_;
  std::string time_;
  Age age_ = Age::kFresh;
};

}  // namespace tendril
