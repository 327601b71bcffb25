#include "ui/model/moving.h"

#include <gtest/gtest.h>

#include <vector>

#include "ui/model/unit_answers.h"

namespace tendril {
namespace {

TEST(Moving, SaysWhatReachesAServo) {
  const MovingFacts sweep{.moves = Moves::kSweep, .port = 3, .port_open = true, .unit = 0x0A, .channel = 2};
  const auto with = [](MovingFacts facts, auto change) {
    change(facts);
    return facts;
  };
  const MovingFacts slider = with(sweep, [](auto& facts) { facts.moves = Moves::kSlider; });
  const auto no_port = [](auto& facts) { facts.port = 0; };
  const auto no_channel = [](auto& facts) { facts.channel.reset(); };
  struct Case {
    MovingFacts facts;
    const char* sentence;
  };
  for (const auto& [facts, sentence] : std::vector<Case>{
           {{}, "Nothing moves"},
           {with(sweep, [](auto& facts) { facts.moves = Moves::kNothing; }), "Nothing moves"},
           {sweep, "Moving channel 3 of unit 0A"},
           {with(sweep, [](auto& facts) { facts.unit = 0xFF; }), "Moving channel 3 of every unit"},
           {with(sweep, no_port), "Drawing only: no port chosen"},
           {with(sweep, no_channel), "Drawing only: no channel chosen"},
           {with(with(sweep, no_channel), no_port), "Drawing only: no port and no channel chosen"},
           {with(sweep, [](auto& facts) { facts.command_runs = true; }), "Drawing only: a command runs"},
           {slider, "The slider moves channel 3 of unit 0A"},
           {with(slider, no_channel), "The slider only draws: no channel chosen"},
           {with(slider, [](auto& facts) { facts.port_open = false; }),
            "The slider's next move opens Comm 3"},
           {with(slider, [](auto& facts) { facts.command_runs = true; }),
            "The slider waits: a command runs"}}) {
    EXPECT_EQ(MovingSentence(facts), sentence);
  }
}

TEST(UnitAnswers, AreThoseOfTheUnitOnThisPort) {
  UnitAnswers answers;
  answers.Note(1, 0x0A, true, "14:02");
  answers.Note(1, 0x01, true, "14:03");
  answers.Note(1, 0x01, false, "14:05");
  EXPECT_EQ(answers.Sentence(1, 0x0A), "Unit 0A answered at 14:02");
  EXPECT_EQ(answers.Sentence(1, 0x01), "Unit 01: no answer at 14:05");
  EXPECT_EQ(answers.Sentence(2, 0x0A), "Unit 0A: not asked yet");
}

}  // namespace
}  // namespace tendril
