// Unit IDs as they are typed: "0A", "0A-1F", "01,05,20-28".
#pragma once

#include <QString>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "platform/hex_text.h"

namespace tendril::ctl {

// "0A".
inline QString IdText(std::uint8_t id) { return QString::fromStdString(HexByte(id)); }

// Whether `text` has the form of an ID list, whatever the values are: hexadecimal numbers of one or two digits with
// commas and hyphens. "01" and "FF-00" do, "1A2" and "./01" do not.
bool LooksLikeUnitIds(std::string_view text);

// The IDs of the list `text`, from kFirstUnitId to kLastUnitId, each once, in the order as given; or the sentence that says
// what is wrong with it. Ranges are ascending.
std::variant<std::vector<std::uint8_t>, std::string> ParseUnitIds(std::string_view text);

// `ids` as such a list: "0A,1C-1F".
std::string UnitIdList(std::span<const std::uint8_t> ids);

}  // namespace tendril::ctl
