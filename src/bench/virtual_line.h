// VirtualLine: a half-duplex serial line with units on it, as a model in which time is only a number.
//
// A byte takes 10 bits of the line's speed. All listeners have it at the end of its last bit. Only one end may
// talk at a time: bytes that overlap come out garbled, as one byte, which is never 0x00 and never 0xFE.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <span>
#include <vector>

#include "platform/bytes.h"

namespace tendril {

// What a unit says: `bytes` one after the other with a silence of `gap_us` before each but the first. Zero
// bytes before the first other byte are pads, sent to bridge the time in which the program's driver releases
// the line.
struct Transmission {
  std::uint64_t start_us = 0;  // later when the unit is still talking then
  Bytes bytes = {};
  std::uint64_t gap_us = 0;
};

// A listener on the line. It hears nothing while it talks.
class LineUnit {
 public:
  virtual ~LineUnit() = default;

  // Hears a byte that was complete at `at_us`. Returns what the unit says because of it, mostly nothing.
  virtual std::vector<Transmission> Hear(std::uint8_t byte, std::uint64_t at_us) = 0;
};

struct VirtualLineOptions {
  std::uint32_t baud = 19200;
  // The program hears what it sends. Off, the adapter switches its driver by itself and hears nothing while
  // it sends; RTS does not matter then.
  bool echo = true;
  // The driver is on while RTS is asserted, and only then. False where RTS cannot be seen: the driver is on
  // just while the program sends.
  bool driver_follows_rts = true;
  // Every n-th byte of the echo gets lost; 0 for none.
  std::uint32_t echo_loses_every = 0;
};

// What went wrong on a line since it was made.
struct LineCounters {
  std::size_t garbled_bytes = 0;   // bytes that did not get through whole, of units and program
  std::size_t undriven_bytes = 0;  // bytes that the program sent while its driver was off
};

enum class LineSide { kProgram, kUnit };

// A byte that crossed the line, as it was heard.
struct LineByte {
  LineSide from = LineSide::kProgram;
  std::uint8_t value = 0;
  bool garbled = false;
  std::uint64_t at_us = 0;  // the end of its last bit
};

// All times are microseconds since some moment and never run backwards. The callbacks and the units are
// called from within AdvanceTo() and from every call that takes a time, in order of time; they must not call
// the line.
class VirtualLine {
 public:
  explicit VirtualLine(const VirtualLineOptions& options = {});
  VirtualLine(const VirtualLine&) = delete;
  VirtualLine& operator=(const VirtualLine&) = delete;

  // The unit must outlive its attachment. Detaching it in the middle of a byte takes that byte with it.
  void Attach(LineUnit& unit);
  void Detach(LineUnit& unit);

  // Gets the bytes that arrive at the program.
  void SetProgramHandler(std::function<void(std::uint8_t byte, std::uint64_t at_us)> handler);
  // Gets every byte on the line, once.
  void SetTap(std::function<void(const LineByte&)> tap);

  // The speed at which the program's end runs, at first the line's own. At any other speed the two ends hear
  // only garbage from each other.
  void SetProgramBaud(std::uint32_t baud, std::uint64_t now_us);

  // Queues bytes that the program sends.
  void ProgramWrites(std::span<const std::uint8_t> bytes, std::uint64_t now_us);
  // Bytes that the program has queued and that have not begun to cross the line.
  std::size_t PendingFromProgram(std::uint64_t now_us);
  void DropPendingFromProgram(std::uint64_t now_us);
  // The program's line driver, as RTS switches it; off at first.
  void SetDriver(bool on, std::uint64_t now_us);

  // The time of the next event, without further calls; nothing on a silent line.
  std::optional<std::uint64_t> NextEventUs() const;
  // Lets everything happen that is due by `now_us`.
  void AdvanceTo(std::uint64_t now_us);

  const LineCounters& counters() const { return counters_; }
  const VirtualLineOptions& options() const { return options_; }

 private:
  struct QueuedByte {
    std::uint8_t value = 0;
    std::uint64_t earliest_us = 0;
    std::uint64_t gap_us = 0;  // silence since the talker's previous byte
    bool pad = false;
    bool last = false;  // of its transmission
  };
  enum class Fate {
    kWhole,
    kGarbled,
    kSwallowed,  // garbled, and heard as part of the byte that it ran into
    kLost        // never seen on the line
  };
  struct ByteOnWire {
    std::uint8_t value = 0;
    std::uint64_t end_us = 0;
    bool pad = false;
    bool last = false;
    Fate fate = Fate::kWhole;
  };
  struct Talker {
    LineUnit* unit = nullptr;  // null: the program
    std::uint32_t baud = 0;
    std::deque<QueuedByte> queue = {};
    std::optional<ByteOnWire> sending = std::nullopt;
    bool talking = false;  // from the first byte of a transmission to the end of its last
    // The bytes since run_start_us that followed each other without a gap: times are counted from there, so
    // that a long run does not drift.
    std::uint64_t run_start_us = 0;
    std::uint64_t run_bytes = 0;
    std::uint64_t free_us = 0;  // end of the previous byte
  };

  Talker& Program() { return talkers_.front(); }
  bool FollowsRts() const { return options_.echo && options_.driver_follows_rts; }
  static std::uint64_t NextStartUs(const Talker& talker);
  static std::optional<std::uint64_t> NextEventUs(const Talker& talker);
  void StartByte(Talker& talker);
  Fate Collide(const Talker& talker, ByteOnWire& starting);
  void OverrideByDriver(ByteOnWire& byte);
  void Spoil(ByteOnWire& byte);
  void EndByte(Talker& talker);
  void Deliver(const Talker& from, const ByteOnWire& byte);
  void DeliverToProgram(const Talker& from, std::uint8_t heard, std::uint64_t at_us);
  void Enqueue(Talker& talker, const Transmission& transmission);

  VirtualLineOptions options_;
  std::vector<Talker> talkers_;  // the program first, then the units
  std::function<void(std::uint8_t, std::uint64_t)> program_handler_;
  std::function<void(const LineByte&)> tap_;
  LineCounters counters_;
  std::uint64_t now_us_ = 0;
  std::uint32_t echoed_bytes_ = 0;
  bool driver_on_ = false;
};

}  // namespace tendril
