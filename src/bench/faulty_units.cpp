#include "bench/faulty_units.h"

#include <algorithm>
#include <array>

namespace tendril {
namespace {

constexpr std::uint8_t kPollCode = 0x88;
constexpr std::uint8_t kUnlockCode = 0x8A;

}  // namespace

std::optional<Bytes> MuteUnit::ReplyData(std::uint8_t /*kind*/) { return std::nullopt; }

std::optional<Bytes> WrongAnswerUnit::ReplyData(std::uint8_t kind) {
  if (kind == '0') return Bytes{1, 11};
  return VirtualUnit::ReplyData(kind);
}

bool LockedUnit::Attends(std::uint8_t code, std::uint64_t /*at_us*/) { return code != kUnlockCode; }

bool DeafUnit::Attends(std::uint8_t code, std::uint64_t /*at_us*/) {
  return code != kPollCode || ++polls_ % every_ != 0;
}

Transmission RamblingUnit::Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) {
  Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
  Bytes noise;
  for (std::size_t i = 0; i < noise_bytes_; ++i) noise.push_back(static_cast<std::uint8_t>(0x11 + i % 0xB5));
  noise.push_back(0);
  reply.bytes.insert(reply.bytes.begin() + static_cast<std::ptrdiff_t>(timing().pads), noise.begin(),
                     noise.end());
  return reply;
}

Transmission SlowUnit::Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) {
  Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
  reply.gap_us = gap_us_;
  return reply;
}

Transmission WrongAddressUnit::Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) {
  Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
  reply.bytes[timing().pads] = id();
  return reply;
}

Transmission UnfinishedUnit::Reply(std::uint8_t kind, const Bytes& data, std::uint64_t poll_end_us) {
  Transmission reply = VirtualUnit::Reply(kind, data, poll_end_us);
  reply.bytes.pop_back();
  return reply;
}

std::optional<Bytes> ShortReplyUnit::ReplyData(std::uint8_t kind) {
  std::optional<Bytes> data = VirtualUnit::ReplyData(kind);
  if (data && ++replies_ % every_ == 0) data->pop_back();
  return data;
}

std::uint8_t ScrambledUnit::NextReportedPort() {
  constexpr std::array<std::uint8_t, kUnitPorts> kOrder = {3, 8, 1, 6, 2, 7, 5, 4};
  return kOrder[reports_++ % kOrder.size()];
}

std::uint8_t RepeatingUnit::NextReportedPort() {
  return static_cast<std::uint8_t>(reports_++ / 2 % kUnitPorts + 1);
}

std::uint8_t MissingPortUnit::NextReportedPort() {
  const std::uint8_t port = VirtualUnit::NextReportedPort();
  return port == 5 ? VirtualUnit::NextReportedPort() : port;
}

std::uint8_t NinthPortUnit::NextReportedPort() {
  return static_cast<std::uint8_t>(reports_++ % (kUnitPorts + 1) + 1);
}

bool RestartingUnit::Attends(std::uint8_t /*code*/, std::uint64_t at_us) { return at_us >= deaf_until_us_; }

void RestartingUnit::TakeAddress(std::uint8_t id, std::uint64_t at_us) {
  VirtualUnit::TakeAddress(id, at_us);
  deaf_until_us_ = at_us + restart_us_;
}

void StubbornUnit::TakeAddress(std::uint8_t /*id*/, std::uint64_t /*at_us*/) {}

namespace {

template <typename Unit>
std::unique_ptr<VirtualUnit> Make(std::uint8_t id) {
  return std::make_unique<Unit>(id);
}

constexpr FaultKind kFaultKinds[] = {
    {"mute", "never answers", Make<MuteUnit>},
    {"wrong-answer", "never acknowledges", Make<WrongAnswerUnit>},
    {"locked", "refuses every configuration command", Make<LockedUnit>},
    {"deaf", "does not hear every second poll", Make<DeafUnit>},
    {"rambling", "sends noise before its reply", Make<RamblingUnit>},
    {"flooding", "sends 5200 bytes of noise before its reply", Make<FloodingUnit>},
    {"slow", "sends one byte every 4.5 ms, just fast enough", Make<SlowUnit>},
    {"too-slow", "sends one byte every 30 ms", Make<TooSlowUnit>},
    {"late", "begins its reply 150 ms after the poll", Make<LateUnit>},
    {"wrong-address", "replies under its own ID", Make<WrongAddressUnit>},
    {"unfinished", "does not end its replies", Make<UnfinishedUnit>},
    {"short-reply", "leaves out a byte of every third reply", Make<ShortReplyUnit>},
    {"scrambled", "reports its ports in another order", Make<ScrambledUnit>},
    {"repeating", "reports every port twice", Make<RepeatingUnit>},
    {"missing-port", "never reports port 5", Make<MissingPortUnit>},
    {"stuck-port", "reports port 3 all the time", Make<StuckPortUnit>},
    {"ninth-port", "reports a port 9", Make<NinthPortUnit>},
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
