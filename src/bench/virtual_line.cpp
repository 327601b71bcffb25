#include "bench/virtual_line.h"

#include <algorithm>
#include <utility>

namespace tendril {
namespace {

constexpr std::uint64_t kBitsPerByte = 10;  // start bit, eight data bits, stop bit

// Rounded up: a byte is never heard before its last bit.
std::uint64_t WireTimeUs(std::uint64_t bytes, std::uint32_t baud) {
  return (bytes * kBitsPerByte * 1'000'000 + baud - 1) / baud;
}

// Always odd, so that noise neither ends a packet (0x00) nor begins a reply (0xFE).
std::uint8_t Garble(std::uint8_t byte) { return static_cast<std::uint8_t>((byte ^ 0x54) | 0x01); }

}  // namespace

VirtualLine::VirtualLine(const VirtualLineOptions& options) : options_(options) {
  talkers_.push_back({.baud = options_.baud});
}

void VirtualLine::Attach(LineUnit& unit) { talkers_.push_back({.unit = &unit, .baud = options_.baud}); }

void VirtualLine::Detach(LineUnit& unit) {
  std::erase_if(talkers_, [&](const Talker& talker) { return talker.unit == &unit; });
}

void VirtualLine::SetProgramHandler(std::function<void(std::uint8_t, std::uint64_t)> handler) {
  program_handler_ = std::move(handler);
}

void VirtualLine::SetTap(std::function<void(const LineByte&)> tap) { tap_ = std::move(tap); }

void VirtualLine::SetProgramBaud(std::uint32_t baud, std::uint64_t now_us) {
  AdvanceTo(now_us);
  if (Program().baud == baud) return;
  Program().baud = baud;
  Program().run_start_us = Program().free_us;  // what was sent so far was timed at the old speed
  Program().run_bytes = 0;
}

void VirtualLine::ProgramWrites(std::span<const std::uint8_t> bytes, std::uint64_t now_us) {
  AdvanceTo(now_us);
  for (const std::uint8_t byte : bytes) Program().queue.push_back({.value = byte, .earliest_us = now_us_});
  AdvanceTo(now_us);  // on a free line the first byte begins at once
}

std::size_t VirtualLine::PendingFromProgram(std::uint64_t now_us) {
  AdvanceTo(now_us);
  return Program().queue.size();
}

void VirtualLine::DropPendingFromProgram(std::uint64_t now_us) {
  AdvanceTo(now_us);
  Program().queue.clear();
}

void VirtualLine::SetDriver(bool on, std::uint64_t now_us) {
  AdvanceTo(now_us);
  if (driver_on_ == on) return;
  driver_on_ = on;
  if (!FollowsRts()) return;
  if (!on) {
    if (Program().sending) Spoil(*Program().sending);  // cut off in the middle
    return;
  }
  for (Talker& talker : talkers_) {
    if (talker.unit != nullptr && talker.sending) OverrideByDriver(*talker.sending);
  }
}

std::uint64_t VirtualLine::NextStartUs(const Talker& talker) {
  const QueuedByte& next = talker.queue.front();
  return std::max(next.earliest_us, talker.free_us + next.gap_us);
}

std::optional<std::uint64_t> VirtualLine::NextEventUs(const Talker& talker) {
  if (talker.sending) return talker.sending->end_us;
  if (!talker.queue.empty()) return NextStartUs(talker);
  return std::nullopt;
}

std::optional<std::uint64_t> VirtualLine::NextEventUs() const {
  std::optional<std::uint64_t> next;
  for (const Talker& talker : talkers_) {
    const auto at_us = NextEventUs(talker);
    if (at_us && (!next || *at_us < *next)) next = at_us;
  }
  return next;
}

void VirtualLine::AdvanceTo(std::uint64_t now_us) {
  while (true) {
    // At one and the same moment bytes end before others begin: a byte that follows directly does not collide.
    Talker* next = nullptr;
    std::pair<std::uint64_t, bool> next_key;
    for (Talker& talker : talkers_) {
      const auto at_us = NextEventUs(talker);
      if (!at_us) continue;
      const std::pair key(*at_us, !talker.sending.has_value());
      if (next == nullptr || key < next_key) {
        next = &talker;
        next_key = key;
      }
    }
    if (next == nullptr || next_key.first > now_us) break;
    now_us_ = std::max(now_us_, next_key.first);
    if (next->sending) {
      EndByte(*next);
    } else {
      StartByte(*next);
    }
  }
  now_us_ = std::max(now_us_, now_us);
}

void VirtualLine::StartByte(Talker& talker) {
  const std::uint64_t start_us = NextStartUs(talker);
  if (start_us != talker.free_us) {
    talker.run_start_us = start_us;
    talker.run_bytes = 0;
  }
  ++talker.run_bytes;
  const QueuedByte queued = talker.queue.front();
  talker.queue.pop_front();

  const bool is_program = talker.unit == nullptr;
  ByteOnWire byte{.value = queued.value,
                  .end_us = talker.run_start_us + WireTimeUs(talker.run_bytes, talker.baud),
                  .pad = queued.pad,
                  .last = queued.last};
  talker.talking = true;
  if (is_program && FollowsRts() && !driver_on_) {
    byte.fate = Fate::kLost;
    ++counters_.undriven_bytes;
  } else {
    byte.fate = Collide(talker, byte);
    if (!is_program && FollowsRts() && driver_on_) OverrideByDriver(byte);
  }
  talker.sending = byte;
}

// What becomes of `starting`, the next byte of `talker`, beside the bytes that are on the line already, and
// of those.
VirtualLine::Fate VirtualLine::Collide(const Talker& talker, ByteOnWire& starting) {
  bool collided = false;
  bool joins_another = false;
  for (Talker& other : talkers_) {
    if (&other == &talker || !other.sending || other.sending->fate == Fate::kLost) continue;
    ByteOnWire& present = *other.sending;
    const bool with_program = talker.unit == nullptr || other.unit == nullptr;
    if (with_program && starting.pad) return Fate::kLost;
    if (with_program && present.pad) {
      present.fate = Fate::kLost;
      continue;
    }
    collided = true;
    Spoil(present);
    joins_another = joins_another || present.fate != Fate::kSwallowed;
  }
  if (!collided) return Fate::kWhole;
  ++counters_.garbled_bytes;
  return joins_another ? Fate::kSwallowed : Fate::kGarbled;
}

// A unit's byte while the program's driver holds the line.
void VirtualLine::OverrideByDriver(ByteOnWire& byte) {
  if (byte.pad) {
    byte.fate = Fate::kLost;
  } else {
    Spoil(byte);
  }
}

void VirtualLine::Spoil(ByteOnWire& byte) {
  if (byte.fate != Fate::kWhole) return;
  byte.fate = Fate::kGarbled;
  ++counters_.garbled_bytes;
}

void VirtualLine::EndByte(Talker& talker) {
  const ByteOnWire byte = *talker.sending;
  talker.sending.reset();
  talker.free_us = byte.end_us;
  if (talker.unit == nullptr || byte.last) talker.talking = false;
  if (byte.fate == Fate::kWhole || byte.fate == Fate::kGarbled) Deliver(talker, byte);
}

void VirtualLine::Deliver(const Talker& from, const ByteOnWire& byte) {
  const bool from_program = from.unit == nullptr;
  const bool garbled = byte.fate == Fate::kGarbled;
  const std::uint8_t on_line = garbled ? Garble(byte.value) : byte.value;
  const bool speeds_differ = Program().baud != options_.baud;
  const std::uint8_t at_far_end = speeds_differ ? Garble(on_line) : on_line;
  if (tap_) {
    tap_({.from = from_program ? LineSide::kProgram : LineSide::kUnit,
          .value = from_program ? at_far_end : on_line,
          .garbled = garbled || (from_program && speeds_differ),
          .at_us = byte.end_us});
  }
  DeliverToProgram(from, from_program ? on_line : at_far_end, byte.end_us);
  for (Talker& listener : talkers_) {
    if (listener.unit == nullptr || &listener == &from || listener.talking) continue;
    for (const Transmission& answer : listener.unit->Hear(from_program ? at_far_end : on_line, byte.end_us)) {
      Enqueue(listener, answer);
    }
  }
}

void VirtualLine::DeliverToProgram(const Talker& from, std::uint8_t heard, std::uint64_t at_us) {
  if (from.unit == nullptr) {
    if (!options_.echo) return;
    ++echoed_bytes_;
    if (options_.echo_loses_every != 0 && echoed_bytes_ % options_.echo_loses_every == 0) return;
  } else if (!options_.echo && Program().sending) {
    return;  // an adapter without echo does not listen while it sends
  }
  if (program_handler_) program_handler_(heard, at_us);
}

void VirtualLine::Enqueue(Talker& talker, const Transmission& transmission) {
  const auto first_of_reply = std::find_if(transmission.bytes.begin(), transmission.bytes.end(),
                                           [](std::uint8_t byte) { return byte != 0; });
  for (auto byte = transmission.bytes.begin(); byte != transmission.bytes.end(); ++byte) {
    const bool first = byte == transmission.bytes.begin();
    talker.queue.push_back({.value = *byte,
                            .earliest_us = std::max(transmission.start_us, now_us_),
                            .gap_us = first ? 0 : transmission.gap_us,
                            .pad = byte < first_of_reply,
                            .last = byte + 1 == transmission.bytes.end()});
  }
}

}  // namespace tendril
