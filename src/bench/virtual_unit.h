// VirtualUnit: a unit with eight servo ports, as it behaves on the line.
//
// Packets to a unit:      00 <unit> <code> <body> 00      unit: its ID, or FF for all
//   unlock                   8A <K>                       opens the lock for the very next packet to the unit
//   options of a port        0A 11 <port 1..8> <nine option bytes> <K>
//   live position            0A 11 89 <port mask> <width / 10> FF <K>
//   any other option         0A <option> <four or more bytes> <K>
//   new ID                   0F <ID> <ID> <ID> <K>
//   poll                     88 <kind> <pad>
// K makes the body's bytes, AA and K add up to 0 modulo 256. Where that would need a K of 0, the pair 80 80
// stands.
//
// The unit's reply to a poll:   [00 pads] FE <kind> <data> 00
//   kind '0'   data: 01, then 0A when a configuration command was accepted since the last such poll, else 01
//   kind 'n'   data: port, its nine option bytes; the next port with the next poll
//   kinds '*' and '+'   data: its ID
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "bench/virtual_line.h"
#include "platform/bytes.h"

namespace tendril {

inline constexpr int kUnitPorts = 8;

// Flag byte, then actual range, virtual range and virtual stops (low and high each), default and neutral
// position in units of 10 microseconds.
using PortOptionBytes = std::array<std::uint8_t, 9>;

// What each port of a unit fresh from the factory holds.
inline constexpr PortOptionBytes kFreshPortOptions = {1, 60, 240, 100, 200, 100, 200, 150, 150};

// How a unit answers a poll.
struct ReplyTiming {
  std::uint64_t turn_round_us = 2000;  // from the end of the poll to the first pad
  std::size_t pads = 3;
};

// Badly behaved units override the protected steps, each of which is one thing that can go wrong.
class VirtualUnit : public LineUnit {
 public:
  // `id` is 0x01 to 0xFF; a unit fresh from the factory has 0xFF.
  explicit VirtualUnit(std::uint8_t id, const ReplyTiming& timing = {});

  std::vector<Transmission> Hear(std::uint8_t byte, std::uint64_t at_us) final;

  std::uint8_t id() const { return id_; }
  // The option bytes that the unit holds for `port`, 1 to 8 (std::out_of_range otherwise).
  const PortOptionBytes& PortOptions(int port) const;
  void SetPortOptions(int port, const PortOptionBytes& options);
  // The position that live commands gave to `port`, in units of 10 microseconds; nothing before the first.
  std::optional<std::uint8_t> LivePosition(int port) const;

  std::size_t accepted_commands() const { return accepted_commands_; }
  // Unlocks and configuration commands that were locked, damaged or unknown.
  std::size_t rejected_commands() const { return rejected_commands_; }
  std::size_t polls_heard() const { return polls_heard_; }

 protected:
  // Whether the unit pays attention to a packet for it, of `code`, that ended at `at_us`.
  virtual bool Attends(std::uint8_t code, std::uint64_t at_us);
  // The data of the reply to a poll; nothing to leave the poll unanswered. No byte is 0.
  virtual std::optional<Bytes> ReplyData(std::uint8_t kind);
  // The reply as it goes over the line after a poll that ended at `poll_end_us`.
  virtual Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us);
  // The port that the next poll 'n' is answered with; as a rule 1 to 8.
  virtual std::uint8_t NextReportedPort();
  // Takes a new ID at `at_us`.
  virtual void TakeAddress(std::uint8_t id, std::uint64_t at_us);

  const ReplyTiming& timing() const { return timing_; }

 private:
  std::vector<Transmission> HandlePacket(const Bytes& packet, std::uint64_t at_us);
  void HandleConfiguration(const Bytes& packet, bool unlocked, std::uint64_t at_us);
  void Apply(std::uint8_t code, const Bytes& body, std::uint64_t at_us);

  std::uint8_t id_;
  ReplyTiming timing_;
  std::array<PortOptionBytes, kUnitPorts> ports_;
  std::array<std::optional<std::uint8_t>, kUnitPorts> live_positions_;

  Bytes packet_;                // since the last zero byte
  bool seen_zero_ = false;      // what comes before the first zero byte is the rest of some packet
  bool unlocked_ = false;       // by the packet before
  bool acknowledge_ = false;    // a command was accepted that no poll has asked about yet
  std::uint8_t next_port_ = 1;  // for NextReportedPort()
  std::size_t accepted_commands_ = 0;
  std::size_t polls_heard_ = 0;
  std::size_t rejected_commands_ = 0;
};

}  // namespace tendril
