#include "unitops/unit_search.h"

#include <algorithm>
#include <cstddef>

#include "platform/hex_text.h"

namespace tendril {
namespace {

constexpr std::size_t kMostNamed = 12;  // in a sentence
// Units that share an ID are few. More are a line that carries bytes at any ID.
constexpr std::size_t kMostShared = 16;

// "01", "01 and 0A", "01, 0A and 7F", "01, 02, ... and 30 more".
std::string Listed(const std::vector<std::string>& ids) {
  const std::size_t named = ids.size() > kMostNamed ? kMostNamed : ids.size() - 1;
  std::string text;
  for (std::size_t i = 0; i < named; ++i) text += (i > 0 ? ", " : "") + ids[i];
  if (named > 0) text += " and ";
  return text + (ids.size() > kMostNamed ? std::to_string(ids.size() - named) + " more" : ids.back());
}

}  // namespace

std::string FoundUnit::Words() const {
  if (perhaps_several) return "perhaps several units";
  return named == id ? "answers" : "answers as " + HexByte(named);
}

std::string UnitSearch::Step() const {
  const auto units =
      std::count_if(found.begin(), found.end(), [](const FoundUnit& unit) { return !unit.perhaps_several; });
  return std::to_string(polled) + " of " + std::to_string(kIds) + ", " + std::to_string(units) + " found";
}

std::string UnitSearch::Sentence() const {
  if (polled == 0) return "No ID was polled.";
  std::vector<std::string> units, shared;
  for (const FoundUnit& unit : found) {
    (unit.perhaps_several ? shared : units)
        .push_back(HexByte(unit.id) + (unit.named == unit.id ? "" : " (as " + HexByte(unit.named) + ")"));
  }
  std::string text;
  if (polled < kIds)
    text +=
        "Only IDs up to " + HexByte(static_cast<std::uint8_t>(kFirstUnitId + polled - 1)) + " were polled. ";
  if (units.empty()) {
    text += "No unit answered";
  } else {
    text +=
        std::to_string(units.size()) + (units.size() == 1 ? " unit" : " units") + " found: " + Listed(units);
  }
  if (!shared.empty()) text += "; perhaps several at " + Listed(shared);
  text += ".";
  if (shared.size() > kMostShared) return text + " So many suggest noise on the line, or a faulty adapter.";
  if (!shared.empty()) return text + " Connect units that share an ID one at a time, and give each its own.";
  if (units.empty() && polled == kIds)
    text += " Check power, wiring and port. A unit fresh from the factory has FF, which is not searched.";
  return text;
}

}  // namespace tendril
