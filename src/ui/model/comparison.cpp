#include "ui/model/comparison.h"

#include <algorithm>
#include <array>
#include <span>

#include "platform/hex_text.h"
#include "ui/model/option_texts.h"

namespace tendril {
namespace {

// The fields: the output kind, the pulse widths in the order of their option bytes, and two options.
constexpr std::size_t kOutputField = 0;
constexpr std::size_t kPowerUpField = kOptionByteCount;
constexpr std::size_t kLostCommField = kPowerUpField + 1;
constexpr std::size_t kFieldCount = kLostCommField + 1;

struct Part {
  const char* name;
  std::size_t first, last;  // field
};
// In the order of ComparedPart.
constexpr std::array<Part, 10> kParts{{{"Output", kOutputField, kOutputField},
                                       {"Actual range", 1, 2},
                                       {"Virtual range", 3, 4},
                                       {"Stops", 5, 6},
                                       {"Left stop", 5, 5},
                                       {"Right stop", 6, 6},
                                       {"Default position", 7, 7},
                                       {"Neutral position", 8, 8},
                                       {"Power up", kPowerUpField, kPowerUpField},
                                       {"Lost communications", kLostCommField, kLostCommField}}};

Microseconds PulseWidth(const ChannelConfig& record, std::size_t field) {
  const std::array widths{record.ActualRange[0],  record.ActualRange[1],  record.VirtualRange[0],
                          record.VirtualRange[1], record.VirtualStops[0], record.VirtualStops[1],
                          record.DefaultPosition, record.NeutralPosition};
  return widths.at(field - 1);
}

// The word of choice 1, 2 ...; any other number in digits.
std::string Word(std::span<const char* const> words, std::int32_t choice) {
  if (choice < 1 || choice > static_cast<std::int32_t>(words.size())) return std::to_string(choice);
  return words[static_cast<std::size_t>(choice) - 1];
}

// The word of the choice that has exactly these flags.
template <typename FlagsOf>
std::string Word(std::span<const char* const> words, std::uint8_t flags, FlagsOf&& flags_of) {
  for (std::int32_t choice = 1; choice <= static_cast<std::int32_t>(words.size()); ++choice) {
    if (flags_of(choice) == flags) return Word(words, choice);
  }
  return "unknown (flags " + HexByte(flags) + ")";
}

std::string Here(const ChannelConfig& record, std::size_t field) {
  switch (field) {
    case kOutputField:
      return Word(kOutputTexts, record.PortType + 1);
    case kPowerUpField:
      return Word(kPowerUpTexts, record.PowerUPOpt);
    case kLostCommField:
      return Word(kLostCommTexts, record.LostCommOption);
    default:
      return std::to_string(PulseWidth(record, field));
  }
}

std::string Held(const OptionBytes& held, std::size_t field) {
  const auto flags = [&held](std::uint8_t mask) { return static_cast<std::uint8_t>(held[0] & mask); };
  switch (field) {
    case kOutputField:
      return Word(kOutputTexts, flags(kKindFlags));
    case kPowerUpField:
      return Word(kPowerUpTexts, flags(kPowerUpFlags), FlagsOfPowerUp);
    case kLostCommField:
      return Word(kLostCommTexts, flags(kLostCommFlags), FlagsOfLostComm);
    default:
      return std::to_string(held.at(field) * kPulseResolution);
  }
}

std::string Counted(int count, const char* what) {
  return std::to_string(count) + " " + what + (count == 1 ? "" : "s");
}

}  // namespace

void Comparison::Begin(const UnitPlace& place, const OptionTable& held, const std::string& time) {
  held_ = held;
  place_ = place;
  time_ = time;
  age_ = Age::kFresh;
}

void Comparison::ReadingFailed(const UnitPlace& place, bool cancelled) {
  if (place == place_) age_ = std::max(age_, cancelled ? Age::kReadingCancelled : Age::kReadingFailed);
}

void Comparison::WritingBegins(const UnitPlace& place) {
  if (MayBeSameUnit(place, place_)) age_ = Age::kSentSince;
}

bool Comparison::Differs(std::size_t channel, std::size_t field) const {
  const ChannelConfig& record = working_.At(channel);
  const OptionBytes& held = held_->at(channel);
  switch (field) {
    case kOutputField:
      return record.PortType + 1 != (held[0] & kKindFlags);
    case kPowerUpField:
      return FlagsOfPowerUp(record.PowerUPOpt) != (held[0] & kPowerUpFlags);
    case kLostCommField:
      return FlagsOfLostComm(record.LostCommOption) != (held[0] & kLostCommFlags);
    default:
      return PulseWidth(record, field) / kPulseResolution != held.at(field);
  }
}

int Comparison::Count(std::size_t channel) const {
  int count = 0;
  for (std::size_t field = 0; held_ && field < kFieldCount; ++field) count += Differs(channel, field) ? 1 : 0;
  return count;
}

// "unit", or with its name when another one is chosen: what follows is no value of that.
std::string Comparison::UnitName() const {
  if (place_ == chosen_) return "unit";
  return "unit " + HexByte(place_.unit) +
         (place_.port == chosen_.port ? ":" : " on Comm " + std::to_string(place_.port) + ":");
}

std::string Comparison::InWords(std::size_t channel, ComparedPart part) const {
  const auto& [name, first, last] = kParts.at(static_cast<std::size_t>(part));
  if (!held_ || !(Differs(channel, first) || Differs(channel, last))) return {};
  const ChannelConfig& record = working_.At(channel);
  const OptionBytes& held = held_->at(channel);
  std::string here = Here(record, first);
  std::string unit = Held(held, first);
  if (last != first) {
    here += " to " + Here(record, last);
    unit += " to " + Held(held, last);
  }
  return "here " + here + ", " + UnitName() + " " + unit + (age_ == Age::kFresh ? "" : " at " + time_);
}

std::string Comparison::InWords(std::size_t channel) const {
  std::string lines;
  for (std::size_t i = 0; i < kParts.size(); ++i) {
    const auto part = static_cast<ComparedPart>(i);
    if (part == ComparedPart::kLeftStop || part == ComparedPart::kRightStop) continue;
    const std::string words = InWords(channel, part);
    if (!words.empty()) lines += (lines.empty() ? "" : "\n") + std::string(kParts[i].name) + ": " + words;
  }
  return lines;
}

std::string Comparison::ChannelSentence(std::size_t channel) const {
  const int count = Count(channel);
  return count == 0 ? "" : "Differs from unit " + HexByte(place_.unit) + ": " + Counted(count, "value");
}

std::string Comparison::Sentence() const {
  if (!held_) return {};
  int values = 0;
  int channels = 0;
  for (std::size_t channel = 0; channel < kPortCount; ++channel) {
    const int count = Count(channel);
    values += count;
    channels += count > 0 ? 1 : 0;
  }
  const bool old = age_ != Age::kFresh;
  std::string sentence = (old ? "What unit " : "Unit ") + HexByte(place_.unit);
  if (place_.port != chosen_.port) sentence += " on Comm " + std::to_string(place_.port);
  if (place_ != chosen_) sentence += ", not the chosen one,";
  if (old) sentence += " held at " + time_;
  sentence += values > 0 ? " differs: " + Counted(values, "value") + " of " + Counted(channels, "channel")
                         : (old ? " is exactly this" : " holds exactly this");
  if (age_ == Age::kReadingCancelled) sentence += "; reading it again was cancelled";
  if (age_ == Age::kReadingFailed) sentence += "; reading it again failed";
  if (age_ == Age::kSentSince) sentence += "; sent to since";
  return sentence;
}

std::string Comparison::Reading() const {
  return "Unit " + HexByte(place_.unit) + " on Comm " + std::to_string(place_.port) + " was read at " +
         time_ + ".";
}

}  // namespace tendril
