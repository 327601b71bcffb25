#include "bench/faulty_units.h"

#include <algorithm>
#include <cstddef>

namespace tendril {
namespace {

constexpr std::uint8_t kPollCode = 0x88;
constexpr std::uint8_t kUnlockCode = 0x8A;

class WrongAnswerUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t kind) override {
    return kind == '0' ? Bytes{1, 11} : VirtualUnit::ReplyData(kind);
  }
};

// Does not know the unlock packet, and so refuses every configuration command.
class LockedUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  bool Attends(std::uint8_t code, std::uint64_t /*at_us*/) override { return code != kUnlockCode; }
};

class DeafUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  bool Attends(std::uint8_t code, std::uint64_t /*at_us*/) override {
    return code != kPollCode || ++polls_ % 2 != 0;
  }

 private:
  std::size_t polls_ = 0;
};

// Sends `noise_bytes` non-zero bytes and one zero byte between its pads and the reply.
class RamblingUnit final : public VirtualUnit {
 public:
  RamblingUnit(std::uint8_t id, int noise_bytes) : VirtualUnit(id), noise_bytes_(noise_bytes) {}

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override {
    Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
    Bytes noise;
    for (int i = 0; i < noise_bytes_; ++i) noise.push_back(static_cast<std::uint8_t>(0x11 + i % 0xB5));
    noise.push_back(0);
    const auto first = reply.bytes.begin() + static_cast<std::ptrdiff_t>(timing().pads);
    reply.bytes.insert(first, noise.begin(), noise.end());
    return reply;
  }

 private:
  int noise_bytes_;
};

// No byte of its replies arrives as it was sent.
class GarblingUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override {
    Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
    for (std::uint8_t& byte : reply.bytes) byte ^= 0x55;
    return reply;
  }
};

// Sends one byte at a time with a silence of `gap_us` between them.
class SlowUnit final : public VirtualUnit {
 public:
  SlowUnit(std::uint8_t id, int gap_us) : VirtualUnit(id), gap_us_(gap_us) {}

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override {
    Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
    reply.gap_us = static_cast<std::uint64_t>(gap_us_);
    return reply;
  }

 private:
  int gap_us_;
};

class LateUnit final : public VirtualUnit {
 public:
  explicit LateUnit(std::uint8_t id) : VirtualUnit(id, {.turn_round_us = 150'000}) {}
};

class WrongAddressUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override {
    Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
    reply.bytes[timing().pads] = id();
    return reply;
  }
};

// Leaves out the zero byte that ends a reply.
class UnfinishedUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  Transmission Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) override {
    Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
    reply.bytes.pop_back();
    return reply;
  }
};

class ShortReplyUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::optional<Bytes> ReplyData(std::uint8_t kind) override {
    std::optional<Bytes> data = VirtualUnit::ReplyData(kind);
    if (data && ++replies_ % 3 == 0) data->pop_back();
    return data;
  }

 private:
  std::size_t replies_ = 0;
};

// Reports `ports` in this order, again and again.
template <std::uint8_t... ports>
class OrderedUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  std::uint8_t NextReportedPort() override {
    constexpr std::uint8_t kOrder[] = {ports...};
    return kOrder[reports_++ % std::size(kOrder)];
  }

 private:
  std::size_t reports_ = 0;
};

class RestartingUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  bool Attends(std::uint8_t /*code*/, std::uint64_t at_us) override { return at_us >= deaf_until_us_; }
  void TakeAddress(std::uint8_t id, std::uint64_t at_us) override {
    VirtualUnit::TakeAddress(id, at_us);
    deaf_until_us_ = at_us + 1'000'000;
  }

 private:
  std::uint64_t deaf_until_us_ = 0;
};

// Acknowledges a new ID and keeps its old one.
class StubbornUnit final : public VirtualUnit {
 public:
  using VirtualUnit::VirtualUnit;

 protected:
  void TakeAddress(std::uint8_t /*id*/, std::uint64_t /*at_us*/) override {}
};

template <typename Unit, int... arguments>
std::unique_ptr<VirtualUnit> Make(std::uint8_t id) {
  return std::make_unique<Unit>(id, arguments...);
}

constexpr FaultKind kFaultKinds[] = {
    {"mute", "never answers", Make<MuteUnit>},
    {"wrong-answer", "never acknowledges", Make<WrongAnswerUnit>},
    {"locked", "refuses every configuration command", Make<LockedUnit>},
    {"deaf", "does not hear every second poll", Make<DeafUnit>},
    {"garbling", "garbles every byte of its replies", Make<GarblingUnit>},
    {"rambling", "sends noise before its reply", Make<RamblingUnit, 5>},
    // More than an input buffer holds, for some 2.7 s.
    {"flooding", "sends 5200 bytes of noise before its reply", Make<RamblingUnit, 5200>},
    // A reply with ten data bytes is within the shortest time-out of a poll.
    {"slow", "sends one byte every 4.5 ms, just fast enough", Make<SlowUnit, 4000>},
    {"too-slow", "sends one byte every 30 ms", Make<SlowUnit, 30'000>},
    {"late", "begins its reply 150 ms after the poll", Make<LateUnit>},
    {"wrong-address", "replies under its own ID", Make<WrongAddressUnit>},
    {"unfinished", "does not end its replies", Make<UnfinishedUnit>},
    {"short-reply", "leaves out a byte of every third reply", Make<ShortReplyUnit>},
    {"scrambled", "reports its ports in another order", Make<OrderedUnit<3, 8, 1, 6, 2, 7, 5, 4>>},
    {"repeating", "reports every port twice",
     Make<OrderedUnit<1, 1, 2, 2, 3, 3, 4, 4, 5, 5, 6, 6, 7, 7, 8, 8>>},
    {"missing-port", "never reports port 5", Make<OrderedUnit<1, 2, 3, 4, 6, 7, 8>>},
    {"stuck-port", "reports port 3 all the time", Make<OrderedUnit<3>>},
    {"ninth-port", "reports a port 9", Make<OrderedUnit<1, 2, 3, 4, 5, 6, 7, 8, 9>>},
    {"restarting", "hears nothing for a second after it took a new ID", Make<RestartingUnit>},
    {"stubborn", "does not take a new ID", Make<StubbornUnit>},
};

}  // namespace

std::span<const FaultKind> FaultKinds() { return kFaultKinds; }

const FaultKind* FindFaultKind(std::string_view name) {
  const auto kind = std::find_if(std::begin(kFaultKinds), std::end(kFaultKinds),
                                 [&](const FaultKind& each) { return each.name == name; });
  return kind == std::end(kFaultKinds) ? nullptr : kind;
}

}  // namespace tendril
