// Readings: what units held when they were read.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <utility>

#include "config/channel_config.h"

namespace tendril {

// What a unit held before it was sent to is kept until the program ends: it is the way back.
class Readings {
 public:
  struct Reading {
    ChannelTable records;
    std::string time;  // "2026-11-22T14:02:31+01:00"
  };

  // `unit` on comm port `port` has given `records`.
  void Keep(std::int16_t port, std::uint8_t unit, const ChannelTable& records, const std::string& time) {
    units_[{port, unit}].latest = {records, time};
  }
  // The same, by a compare. The way back of a unit that was sent to stays: this may be what was sent.
  void KeepCompared(std::int16_t port, std::uint8_t unit, const ChannelTable& records,
                    const std::string& time) {
    if (!units_[{port, unit}].before_send) Keep(port, unit, records, time);
  }
  // A send to the unit, or with FF to every unit on the port, begins: the latest reading is the way back, until the next
  // send after another reading. False: the unit was neither read nor sent to before.
  bool SendBegins(std::int16_t port, std::uint8_t unit);

  // The way back of the unit, or while it was not sent to, what it held when it was read last; nullptr when it was not
  // read before.
  const Reading* WayBack(std::int16_t port, std::uint8_t unit) const;

 private:
  struct Unit {
    std::optional<Reading> latest;  // since the last send
    std::optional<Reading> before_send;
  };
  std::map<std::pair<std::int16_t, std::uint8_t>, Unit> units_;
};

}  // namespace tendril
