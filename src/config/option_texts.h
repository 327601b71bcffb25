// The texts of a channel's options, for the controls that choose them and for sentences about them.
#pragma once

#include <array>

namespace tendril {

// Of PortType, from 0.
inline constexpr std::array kOutputTexts{"Servo", "Digital", "PWM"};
// Of PowerUPOpt and LostCommOption, from 1.
inline constexpr std::array kPowerUpTexts{"Move to Default Position", "Move to Neutral Position",
                                          "Start Pulse on First Command"};
inline constexpr std::array kLostCommTexts{"Hold at Current Position", "Move to Default Position",
                                           "Move to Neutral Position", "Stop Pulse / Start on First Command"};

}  // namespace tendril
