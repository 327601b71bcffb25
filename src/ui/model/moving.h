// What moves a servo now, in words.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

namespace tendril {

// What can be stopped.
enum class Moves { kNothing, kSweep, kSlider };

// What the live test does, and what its commands need to get to a servo.
struct MovingFacts {
  Moves moves = Moves::kNothing;
  std::int16_t port = 0;  // the chosen comm port; 0: none
  bool port_open = false;
  std::uint8_t unit = 0;
  std::optional<std::size_t> channel;  // 0 to 7
  bool command_runs = false;

  bool operator==(const MovingFacts&) const = default;
};

// "Nothing moves", "Moving channel 3 of unit 01", "Drawing only: no port chosen" ... A command of the live test opens
// the chosen port when it is closed.
std::string MovingSentence(const MovingFacts& facts);

}  // namespace tendril
