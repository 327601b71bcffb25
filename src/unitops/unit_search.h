// UnitSearch: what a search for units has found.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "unitops/unit_target.h"

namespace tendril {

// Something answers at an ID.
struct FoundUnit {
  enum class What {
    kAnswers,
    kAnswersLate,    // its reply came to the poll of another ID
    kOtherAnswer,    // an answer to something else
    kPerhapsSeveral  // bytes that make no reply
  };

  std::uint8_t id;
  What what;

  // "answers", "answers too late", "answers something else", "perhaps several units".
  std::string Words() const;
};

// The IDs from `first` to `last` are polled in order.
struct UnitSearch {
  std::uint8_t first = kFirstUnitId;
  std::uint8_t last = kLastUnitId;
  std::int16_t port = 0;              // the comm port; 0 for none
  int polled = 0;                     // IDs that have been polled
  std::vector<FoundUnit> found = {};  // in order of ID
  std::string fault = {};  // what the last poll says about the adapter: a sentence; empty for nothing

  // How many IDs are searched.
  int Count() const { return last - first + 1; }
  // Whether each of them has been polled.
  bool Complete() const { return polled == Count(); }
  // Adds what was found at `id`, unless there is something already.
  void Add(std::uint8_t id, FoundUnit::What what);
  // "57 of 253, 3 found".
  std::string Step() const;
  // What part of the IDs has been polled, 0 to 1.
  double Part() const { return static_cast<double>(polled) / Count(); }
  // The result, and what to do next: "3 units found: 01, 0A and 7F; perhaps several at 20."
  std::string Sentence() const;

 private:
  std::vector<std::string> Ids(FoundUnit::What what) const;
  std::string WhatNext(std::size_t shared) const;
};

}  // namespace tendril
