#include "ui/model/comparison.h"

#include <gtest/gtest.h>

#include <functional>

namespace tendril {
namespace {

class Comparing : public testing::Test {
 protected:
  Comparing() {
    for (std::size_t channel = 0; channel < kPortCount; ++channel) {
      SetFromPreset(kPresets[1], working_.At(channel));
      held_[channel] = std::get<OptionBytes>(EncodeOptions(working_.At(channel)));
    }
    comparison_.Choose(kPlace);
  }

  static constexpr UnitPlace kPlace{1, 0x01};
  ChannelTable working_;
  OptionTable held_{};
  Comparison comparison_{working_};
};

TEST_F(Comparing, EqualMeansTheSameOptionBytes) {
  const ChannelTable records = working_;
  const OptionTable held = held_;
  ChannelConfig& record = working_.At(4);
  OptionBytes& bytes = held_[4];
  struct Case {
    std::function<void()> change;
    std::string words;
  };
  for (const auto& [change, words] : std::initializer_list<Case>{
           {[&] { record.ActualRange[0] = 609; }, ""},
           {[&] { bytes[2] ^= 1; }, "Actual range: here 600 to 2400, unit 600 to 2410"},
           {[&] { record.VirtualStops[0] = 1105; }, "Stops: here 1105 to 2000, unit 1000 to 2000"},
           {[&] { bytes[7] = 151; }, "Default position: here 1500, unit 1510"},
           {[&] { bytes[0] ^= kFlagPowerUp | kFlagPowerUpNeutral; },
            "Power up: here Start Pulse on First Command, unit Move to Neutral Position"},
           // A get would read it as no move.
           {[&] { bytes[0] ^= kFlagPowerUpNeutral; },
            "Power up: here Start Pulse on First Command, unit unknown (flags 40)"},
           // No unit can be given this record.
           {[&] {
              record.PortType = -1;
              bytes[0] = 0;  // as it was read
              record.PowerUPOpt = 7;
              record.VirtualRange = {-15, 2700};
            },
            "Virtual range: here -15 to 2700, unit 1000 to 2000\n"
            "Power up: here 7, unit Start Pulse on First Command"}}) {
    change();
    comparison_.Begin(kPlace, held_, "14:02");
    EXPECT_EQ(comparison_.InWords(4), words);
    EXPECT_EQ(comparison_.Count(4) == 0, words.empty());
    EXPECT_EQ(comparison_.Count(3), 0);
    working_ = records;
    held_ = held;
  }
}

TEST_F(Comparing, SaysAboutWhichUnitAndWhen) {
  const auto expect = [this](const char* sentence, const char* words) {
    EXPECT_EQ(comparison_.Sentence(), sentence);
    EXPECT_EQ(comparison_.InWords(2, ComparedPart::kOutput), words);
  };
  working_.At(2).PortType = kPortPwm;
  expect("", "");
  comparison_.Begin(kPlace, held_, "14:02");
  expect("Unit 01 differs: 1 value of 1 channel", "here PWM, unit Servo");
  working_.At(2).VirtualStops = {900, 2100};
  expect("Unit 01 differs: 3 values of 1 channel", "here PWM, unit Servo");
  working_.At(7).NeutralPosition = 1600;
  comparison_.Choose({1, 0x02});
  expect("Unit 01, not the chosen one, differs: 4 values of 2 channels", "here PWM, unit 01: Servo");
  comparison_.Choose({2, 0x01});
  comparison_.ReadingFailed({2, 0x01}, false);
  comparison_.WritingBegins({2, 0xFF});
  expect("Unit 01 on Comm 1, not the chosen one, differs: 4 values of 2 channels",
         "here PWM, unit 01 on Comm 1: Servo");
  comparison_.Choose(kPlace);
  comparison_.ReadingFailed(kPlace, true);
  expect("What unit 01 held at 14:02 differs: 4 values of 2 channels; reading it again was cancelled",
         "here PWM, unit Servo at 14:02");
  comparison_.ReadingFailed(kPlace, false);
  expect("What unit 01 held at 14:02 differs: 4 values of 2 channels; reading it again failed",
         "here PWM, unit Servo at 14:02");
  working_.At(7) = working_.At(2) = working_.At(0);
  comparison_.WritingBegins({1, 0xFF});
  comparison_.ReadingFailed(kPlace, false);
  expect("What unit 01 held at 14:02 is exactly this; sent to since", "");
}

}  // namespace
}  // namespace tendril
