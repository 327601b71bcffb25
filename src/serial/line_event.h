// LineEvent: what happens on the line to the network, for those who watch it.
#pragma once

#include <cstdint>
#include <functional>
#include <span>
#include <string_view>

namespace tendril {

struct LineEvent {
  enum class Kind {
    kOpened,      // text: the port and its speed
    kOpenFailed,  // text: the system's reason
    kClosed,
    kLost,  // the device was unplugged: the port is closed
    kRtsOn,
    kRtsOff,
    kFault,     // text: what the device refuses, and why
    kSent,      // bytes
    kPollSent,  // bytes: the poll
    kReceived,  // bytes: what has arrived, in pieces of any size
    kDropped,   // bytes: the same, and no poll takes it
    kTimeOut    // of the poll, after everything that has arrived
  };

  Kind kind;
  std::span<const std::uint8_t> bytes = {};
  std::string_view text = {};
};

// Is called for each event in order, from within the link. It raises nothing and does not call the link. `bytes` and
// `text` end with the call.
using LineObserver = std::function<void(const LineEvent&)>;

}  // namespace tendril
