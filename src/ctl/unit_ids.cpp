#include "ctl/unit_ids.h"

#include <algorithm>
#include <charconv>
#include <optional>

#include "unitops/unit_target.h"

namespace tendril::ctl {
namespace {

struct IdRange {
  std::uint8_t first, last;
};

// A hexadecimal number of one or two digits.
std::optional<std::uint8_t> ParseByte(std::string_view text) {
  std::uint8_t value = 0;
  const char* const end = text.data() + text.size();
  if (text.empty() || text.size() > 2) return std::nullopt;
  const auto [stopped, error] = std::from_chars(text.data(), end, value, 16);
  return error == std::errc() && stopped == end ? std::optional(value) : std::nullopt;
}

// "0A" or "0A-1F".
std::optional<IdRange> ParseRange(std::string_view text) {
  const std::size_t hyphen = text.find('-');
  const auto first = ParseByte(text.substr(0, hyphen));
  const auto last = hyphen == text.npos ? first : ParseByte(text.substr(hyphen + 1));
  return first && last ? std::optional(IdRange{*first, *last}) : std::nullopt;
}

// Calls `take` for each part of a list until it returns false. Returns whether it never did.
bool EachPart(std::string_view list, const auto& take) {
  for (;;) {
    const std::size_t comma = list.find(',');
    if (!take(list.substr(0, comma))) return false;
    if (comma == list.npos) return true;
    list.remove_prefix(comma + 1);
  }
}

// Why no unit is addressed by `id`; empty: one can be.
std::string WhyNot(std::uint8_t id) {
  if (id < kFirstUnitId) return "no unit can be found at 00: IDs are 01 to FD.";
  if (id == 0xFE) return "a unit at FE cannot be reached through an adapter with an echo: IDs are 01 to FD.";
  if (id > kLastUnitId)
    return "FF addresses every unit on the line: only set-id uses it, to give a unit an ID from 01 to FD.";
  return {};
}

// What is wrong with `range`, which was typed as `text`; empty: nothing.
std::string Fault(const std::optional<IdRange>& range, std::string_view text) {
  const std::string typed = "\"" + std::string(text) + "\"";
  if (!range) return typed + " is no unit ID: IDs are hexadecimal, 01 to FD.";
  if (range->first > range->last) return typed + " is no range of unit IDs: the smaller one comes first.";
  const std::string fault = WhyNot(range->first);
  return fault.empty() ? WhyNot(range->last) : fault;
}

}  // namespace

bool LooksLikeUnitIds(std::string_view text) {
  return EachPart(text, [](std::string_view part) { return ParseRange(part).has_value(); });
}

std::variant<std::vector<std::uint8_t>, std::string> ParseUnitIds(std::string_view text) {
  std::vector<std::uint8_t> ids;
  std::string fault;
  EachPart(text, [&](std::string_view part) {
    const std::optional<IdRange> range = ParseRange(part);
    fault = Fault(range, part);
    if (!fault.empty()) return false;
    for (int id = range->first; id <= range->last; ++id) {
      if (std::ranges::find(ids, id) == ids.end()) ids.push_back(static_cast<std::uint8_t>(id));
    }
    return true;
  });
  if (!fault.empty()) return fault;
  return ids;
}

std::string UnitIdList(std::span<const std::uint8_t> ids) {
  std::string list;
  for (std::size_t first = 0, last = 0; first < ids.size(); first = ++last) {
    while (last + 1 < ids.size() && ids[last + 1] == ids[last] + 1) ++last;
    list += (list.empty() ? "" : ",") + HexByte(ids[first]);
    if (last > first) list += "-" + HexByte(ids[last]);
  }
  return list;
}

}  // namespace tendril::ctl
