#include "unitops/unit_search.h"

#include <algorithm>
#include <cstddef>

#include "platform/hex_text.h"
#include "serial/packets.h"

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
  switch (what) {
    case What::kAnswers:
      return "answers";
    case What::kAnswersLate:
      return "answers too late";
    case What::kOtherAnswer:
      return "answers something else";
    case What::kPerhapsSeveral:
      return "perhaps several units";
  }
  return {};
}

void UnitSearch::Add(std::uint8_t id, FoundUnit::What what) {
  const bool known =
      std::any_of(found.begin(), found.end(), [id](const FoundUnit& unit) { return unit.id == id; });
  if (!known) found.push_back({id, what});
}

std::vector<std::string> UnitSearch::Ids(FoundUnit::What what) const {
  std::vector<std::string> ids;
  for (const FoundUnit& unit : found) {
    if (unit.what != what) continue;
    ids.push_back(HexByte(unit.id));
  }
  return ids;
}

std::string UnitSearch::Step() const {
  return std::to_string(polled) + " of " + std::to_string(Count()) + ", " +
         std::to_string(Ids(FoundUnit::What::kAnswers).size()) + " found";
}

std::string UnitSearch::Sentence() const {
  if (polled == 0) return "No ID was polled.";
  const auto units = Ids(FoundUnit::What::kAnswers);
  const auto late = Ids(FoundUnit::What::kAnswersLate);
  const auto others = Ids(FoundUnit::What::kOtherAnswer);
  const auto shared = Ids(FoundUnit::What::kPerhapsSeveral);
  std::string text;
  if (!Complete()) {
    text += "Only IDs up to " + HexByte(static_cast<std::uint8_t>(first + polled - 1)) + " were polled. ";
  }
  if (units.empty()) {
    text += "No unit answered";
  } else {
    text +=
        std::to_string(units.size()) + (units.size() == 1 ? " unit" : " units") + " found: " + Listed(units);
  }
  if (!late.empty()) text += "; too late: " + Listed(late);
  if (!shared.empty()) text += "; perhaps several at " + Listed(shared);
  if (!others.empty()) text += "; an answer to something else at " + Listed(others);
  return text + "." + (Complete() ? WhatNext(shared.size()) : "");
}

std::string UnitSearch::WhatNext(std::size_t shared) const {
  if (shared > kMostShared) return " So many suggest noise on the line, or a faulty adapter.";
  if (shared > 0) return " Connect units that share an ID one at a time, and give each its own.";
  if (!found.empty()) return {};
  if (!fault.empty()) return " " + fault;
  std::string check = " Check power, wiring and port.";
  if (last == kAllUnits) return check;
  if (first > kFirstUnitId || last < kLastUnitId) return check + " Other IDs are not searched.";
  return check + " A unit fresh from the factory has FF, which is not searched.";
}

}  // namespace tendril
