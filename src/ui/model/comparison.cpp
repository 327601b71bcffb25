#include "ui/model/comparison.h"

#include <algorithm>

#include "platform/hex_text.h"

namespace tendril {
namespace {

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

int Comparison::Count(std::size_t channel) const {
  if (!held_) return 0;
  int count = 0;
  for (const ComparedPart part : kWholeParts)
    count += CountDiffering(working_.At(channel), held_->at(channel), part);
  return count;
}

// "unit", or with its name when another one is chosen: what follows is no value of that.
std::string Comparison::UnitName() const {
  if (place_ == chosen_) return "unit";
  return "unit " + HexByte(place_.unit) +
         (place_.port == chosen_.port ? ":" : " on Comm " + std::to_string(place_.port) + ":");
}

std::string Comparison::InWords(std::size_t channel, ComparedPart part) const {
  if (!held_) return {};
  const ChannelConfig& record = working_.At(channel);
  const OptionBytes& held = held_->at(channel);
  if (CountDiffering(record, held, part) == 0) return {};
  return "here " + tendril::InWords(record, part) + ", " + UnitName() + " " + tendril::InWords(held, part) +
         (age_ == Age::kFresh ? "" : " at " + time_);
}

std::string Comparison::InWords(std::size_t channel) const {
  std::string lines;
  for (const ComparedPart part : kWholeParts) {
    const std::string words = InWords(channel, part);
    if (!words.empty()) lines += (lines.empty() ? "" : "\n") + std::string(NameOf(part)) + ": " + words;
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
