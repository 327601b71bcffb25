#include "config/option_differences.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

#include "config/option_texts.h"
#include "platform/hex_text.h"

namespace tendril {
namespace {

// The fields: the output kind, the pulse widths in the order of their option bytes, and two options.
constexpr std::size_t kOutputField = 0;
constexpr std::size_t kPowerUpField = kOptionByteCount;
constexpr std::size_t kLostCommField = kPowerUpField + 1;

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

const Part& FieldsOf(ComparedPart part) { return kParts.at(static_cast<std::size_t>(part)); }

Microseconds PulseWidth(const ChannelConfig& record, std::size_t field) {
  const std::array widths{record.ActualRange[0],  record.ActualRange[1],  record.VirtualRange[0],
                          record.VirtualRange[1], record.VirtualStops[0], record.VirtualStops[1],
                          record.DefaultPosition, record.NeutralPosition};
  return widths.at(field - 1);
}

// The bits of a field as a unit holds them; nothing for an option that EncodeOptions rejects.
std::optional<int> Bits(const ChannelConfig& record, std::size_t field) {
  switch (field) {
    case kOutputField:
      return record.PortType + 1;
    case kPowerUpField:
      return FlagsOfPowerUp(record.PowerUPOpt);
    case kLostCommField:
      return FlagsOfLostComm(record.LostCommOption);
    default:
      return PulseWidth(record, field) / kPulseResolution;
  }
}

std::optional<int> Bits(const OptionBytes& held, std::size_t field) {
  switch (field) {
    case kOutputField:
      return held[0] & kKindFlags;
    case kPowerUpField:
      return held[0] & kPowerUpFlags;
    case kLostCommField:
      return held[0] & kLostCommFlags;
    default:
      return held.at(field);
  }
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

std::string FieldInWords(const ChannelConfig& record, std::size_t field) {
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

std::string FieldInWords(const OptionBytes& held, std::size_t field) {
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

template <typename Port>
std::string PartInWords(const Port& port, ComparedPart part) {
  const auto& [name, first, last] = FieldsOf(part);
  const std::string words = FieldInWords(port, first);
  return first == last ? words : words + " to " + FieldInWords(port, last);
}

template <typename Port>
int CountFields(const Port& wanted, const OptionBytes& held, ComparedPart part) {
  const auto& [name, first, last] = FieldsOf(part);
  int count = 0;
  for (std::size_t field = first; field <= last; ++field) {
    if (Bits(wanted, field) != Bits(held, field)) ++count;
  }
  return count;
}

}  // namespace

const char* NameOf(ComparedPart part) { return FieldsOf(part).name; }

std::string InWords(const ChannelConfig& record, ComparedPart part) { return PartInWords(record, part); }

std::string InWords(const OptionBytes& held, ComparedPart part) { return PartInWords(held, part); }

int CountDiffering(const ChannelConfig& record, const OptionBytes& held, ComparedPart part) {
  return CountFields(record, held, part);
}

std::vector<OptionDifference> DifferencesBetween(const OptionBytes& wanted, const OptionBytes& held) {
  std::vector<OptionDifference> differences;
  for (const ComparedPart part : kWholeParts) {
    if (CountFields(wanted, held, part) > 0)
      differences.push_back({part, InWords(wanted, part), InWords(held, part)});
  }
  return differences;
}

}  // namespace tendril
