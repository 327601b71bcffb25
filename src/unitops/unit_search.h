// UnitSearch: what a search for units has found.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "unitops/unit_target.h"

namespace tendril {

// Something answers at an ID.
struct FoundUnit {
  std::uint8_t id;
  std::uint8_t named;    // the ID that its reply names; another one when a unit answers late
  bool perhaps_several;  // bytes came that make no reply

  // "answers", "answers as 05", "perhaps several units".
  std::string Words() const;
};

// The IDs are polled in order, from kFirstUnitId to kLastUnitId.
struct UnitSearch {
  static constexpr int kIds = kLastUnitId - kFirstUnitId + 1;

  int polled = 0;                // IDs that have been polled
  std::vector<FoundUnit> found;  // in order of ID

  // "57 of 253, 3 found".
  std::string Step() const;
  // The result, and what to do next: "3 units found: 01, 0A and 7F; perhaps several at 20."
  std::string Sentence() const;
};

}  // namespace tendril
