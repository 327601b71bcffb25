// Badly behaved units. Each does everything as a VirtualUnit does, except for the one thing that its name
// says.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "bench/virtual_unit.h"

namespace tendril {

// Hears and obeys, and never answers.
class MuteUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t kind) override;
};

// Answers every poll '0' with a byte 1 that is not the acknowledgement.
class WrongAnswerUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t kind) override;
};

// Does not know the unlock packet, and so refuses every configuration command.
class LockedUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  bool Attends(std::uint8_t code, std::uint64_t at_us) override;
};

// Does not hear every n-th poll; `every` is at least 1.
class DeafUnit final : public VirtualUnit {
 public:
  explicit DeafUnit(std::uint8_t id, std::size_t every = 2) : VirtualUnit(id), every_(every) {}

 protected:
  bool Attends(std::uint8_t code, std::uint64_t at_us) override;

 private:
  std::size_t every_;
  std::size_t polls_ = 0;
};

// Puts noise between its pads and the reply.
class RamblingUnit : public VirtualUnit {
 public:
  // `noise_bytes` non-zero bytes and one zero byte.
  explicit RamblingUnit(std::uint8_t id, std::size_t noise_bytes = 5)
      : VirtualUnit(id), noise_bytes_(noise_bytes) {}

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override;

 private:
  std::size_t noise_bytes_;
};

// Sends more noise than an input buffer holds, for some 2.7 s at 19200 baud, before its reply.
class FloodingUnit final : public RamblingUnit {
 public:
  explicit FloodingUnit(std::uint8_t id) : RamblingUnit(id, 5200) {}
};

// Sends one byte at a time with silences between them.
class SlowUnit : public VirtualUnit {
 public:
  // The default keeps a reply with ten data bytes within the shortest time-out that polls get at 19200 baud.
  explicit SlowUnit(std::uint8_t id, std::uint64_t gap_us = 4000) : VirtualUnit(id), gap_us_(gap_us) {}

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override;

 private:
  std::uint64_t gap_us_;
};

// Sends one byte at a time, so slowly that the program has given up before the reply ends.
class TooSlowUnit final : public SlowUnit {
 public:
  explicit TooSlowUnit(std::uint8_t id) : SlowUnit(id, 30'000) {}
};

// Begins its reply when the program has given up on it and polls again.
class LateUnit final : public VirtualUnit {
 public:
  explicit LateUnit(std::uint8_t id) : VirtualUnit(id, {.turn_round_us = 150'000}) {}
};

// Replies under its own ID.
class WrongAddressUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override;
};

// Leaves out the zero byte that ends a reply.
class UnfinishedUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override;
};

// Leaves out the last data byte of every n-th reply; `every` is at least 1.
class ShortReplyUnit final : public VirtualUnit {
 public:
  explicit ShortReplyUnit(std::uint8_t id, std::size_t every = 3) : VirtualUnit(id), every_(every) {}

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t kind) override;

 private:
  std::size_t every_;
  std::size_t replies_ = 0;
};

// Reports its ports in an order of its own.
class ScrambledUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::uint8_t NextReportedPort() override;

 private:
  std::size_t reports_ = 0;
};

// Reports every port twice in a row.
class RepeatingUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::uint8_t NextReportedPort() override;

 private:
  std::size_t reports_ = 0;
};

// Never reports port 5.
class MissingPortUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::uint8_t NextReportedPort() override;
};

// Reports port 3 all the time.
class StuckPortUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::uint8_t NextReportedPort() override { return 3; }
};

// Reports a port 9 after port 8.
class NinthPortUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::uint8_t NextReportedPort() override;

 private:
  std::size_t reports_ = 0;
};

// Takes a new ID, then starts anew and hears nothing for a while.
class RestartingUnit final : public VirtualUnit {
 public:
  explicit RestartingUnit(std::uint8_t id, std::uint64_t restart_us = 1'000'000)
      : VirtualUnit(id), restart_us_(restart_us) {}

 protected:
  bool Attends(std::uint8_t code, std::uint64_t at_us) override;
  void TakeAddress(std::uint8_t id, std::uint64_t at_us) override;

 private:
  std::uint64_t restart_us_;
  std::uint64_t deaf_until_us_ = 0;
};

// Acknowledges a new ID and keeps its old one.
class StubbornUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  void TakeAddress(std::uint8_t id, std::uint64_t at_us) override;
};

// The badly behaved units by name, as a person asks for them.
struct FaultKind {
  std::string_view name;
  std::string_view description;  // half a sentence: "never answers"
  std::unique_ptr<VirtualUnit> (*make)(std::uint8_t id) = nullptr;
};

std::span<const FaultKind> FaultKinds();
// The kind called `name`, or null.
const FaultKind* FindFaultKind(std::string_view name);

}  // namespace tendril
