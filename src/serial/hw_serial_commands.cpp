// HwSerial's commands: packets.h builds them, SendCommand and XmitData bring them out.
#include <utility>

#include "platform/hex_text.h"
#include "platform/runtime_error.h"
#include "serial/hw_serial.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr std::int16_t kUnitWide = 32767;
// Circuits from here on are not light circuits: their commands are sent at once and logged.
constexpr std::int16_t kCircuitLimit = 1024;
// The intensity argument of commands that have none.
constexpr std::uint8_t kNoIntensity = 255;
constexpr std::uint8_t kFirstBufferedCode = kCodeSetIntensity;
constexpr std::uint8_t kLastBufferedCode = kCodeDmxIntensity;
constexpr std::size_t kMaxMoreOptions = 25;
// The kind of the poll that may follow a change of the ID.
constexpr std::uint8_t kPollAfterSetAddress = 2;

bool TakesTwoBytes(std::int16_t circuit) { return circuit >= kFirstTwoByteCircuit; }

[[noreturn]] void RejectUnsupported(const char* what) {
  throw RuntimeError(kErrUnsupported, std::string(what) + " is not supported");
}

}  // namespace

void HwSerial::cmdSetIntensity(std::uint8_t unit, std::int16_t circuit, std::uint8_t intensity) {
  Traced("Trace: SetIntensity", [&] {
    OpenPort();
    SendCommand(unit, circuit, kCodeSetIntensity, intensity, SetIntensityPacket(unit, circuit, intensity),
                TakesTwoBytes(circuit));
  });
}

void HwSerial::CmdSetDMXIntensity(std::uint8_t unit, std::int16_t circuit, std::uint8_t value) {
  Traced("Trace: SetIntensity", [&] {
    OpenPort();
    if (value == 0) {
      cmdSetIntensity(unit, circuit, 0);  // a zero byte would end the packet
      return;
    }
    SendCommand(unit, circuit, kCodeDmxIntensity, kNoIntensity, DmxIntensityPacket(unit, circuit, value),
                TakesTwoBytes(circuit));
  });
}

void HwSerial::cmdFade(std::uint8_t unit, std::int16_t circuit, std::uint8_t time, std::uint8_t from,
                       std::uint8_t to) {
  Traced("Trace: Fade", [&] {
    OpenPort();
    SendCommand(unit, circuit, kCodeFade, kNoIntensity, FadePacket(unit, circuit, time, from, to),
                TakesTwoBytes(circuit));
  });
}

void HwSerial::cmdSetTwinkle(std::uint8_t unit, std::int16_t circuit) {
  Traced("Trace: SetTwinkle", [&] {
    OpenPort();
    SendCommand(unit, circuit, kCodeTwinkle, kNoIntensity, EffectPacket(unit, circuit, kCodeTwinkle),
                TakesTwoBytes(circuit));
  });
}

void HwSerial::cmdSetShimmer(std::uint8_t unit, std::int16_t circuit) {
  Traced("Trace: SetShimmer", [&] {
    OpenPort();
    SendCommand(unit, circuit, kCodeShimmer, kNoIntensity, EffectPacket(unit, circuit, kCodeShimmer),
                TakesTwoBytes(circuit));
  });
}

void HwSerial::cmdSetTwinkleSpecial(std::uint8_t /*unit*/, std::int16_t /*circuit*/, std::uint8_t /*a*/,
                                    std::uint8_t /*b*/, std::uint8_t /*c*/) {
  Traced("Trace: SetTwinkleSpecial", [] { RejectUnsupported("The special twinkle command"); });
}

void HwSerial::cmdSetShimmerSpecial(std::uint8_t /*unit*/, std::int16_t /*circuit*/, std::uint8_t /*a*/,
                                    std::uint8_t /*b*/, std::uint8_t /*c*/) {
  Traced("Trace: SetShimmerSpecial", [] { RejectUnsupported("The special shimmer command"); });
}

void HwSerial::SendUnlockCmd(std::uint8_t unit) {
  Traced("Trace: SendUnlockCmd", [&] {
    OpenPort();
    SendCommand(unit, kUnitWide, kCodeUnlock, kNoIntensity, UnlockPacket(unit));
  });
}

void HwSerial::cmdSetAddress(std::uint8_t unit, std::uint8_t new_id, bool poll_after) {
  Traced("Trace: SetAddress", [&] {
    OpenPort();
    SendUnlockCmd(unit);
    SendCommand(unit, kUnitWide, kCodeSetAddress, kNoIntensity, SetAddressPacket(unit, new_id));
    if (poll_after) cmdPollStation(new_id, kPollAfterSetAddress);
  });
}

void HwSerial::cmdSetoption(std::uint8_t unit, std::int16_t circuit, std::uint8_t b1, std::uint8_t b2,
                            std::uint8_t b3, std::uint8_t b4, std::uint8_t b5) {
  // The trace lines of the two option commands are the fade's: that is how support knows them.
  Traced("Trace: Fade", [&] {
    OpenPort();
    SendUnlockCmd(unit);
    SendCommand(unit, circuit, kCodeSetOption, kNoIntensity,
                BuildChecksummedPacket(unit, kCodeSetOption, std::array{b1, b2, b3, b4, b5}));
  });
}

void HwSerial::cmdSetManyOptions(std::uint8_t unit, std::int16_t circuit, std::uint8_t b1, std::uint8_t b2,
                                 std::uint8_t b3, std::uint8_t b4, std::uint8_t b5,
                                 std::span<const std::uint8_t> more) {
  Traced("Trace: Fade", [&] {
    if (more.size() > kMaxMoreOptions) throw RuntimeError(kErrOutOfRange, "Too many option bytes");
    OpenPort();
    SendUnlockCmd(unit);
    Bytes body{b1, b2, b3, b4, b5};
    for (const std::uint8_t byte : more) {
      if (byte == 0) break;
      body.push_back(byte);
    }
    SendCommand(unit, circuit, kCodeSetOption, kNoIntensity,
                BuildChecksummedPacket(unit, kCodeSetOption, body));
  });
}

void HwSerial::FlushCB() { RejectUnsupported("Flushing the command buffer"); }

Bytes HwSerial::TakeBlock() { return std::exchange(block_, {}); }

void HwSerial::SendCommand(std::uint8_t unit, std::int16_t circuit, std::uint8_t code, std::uint8_t intensity,
                           const Bytes& packet, bool two_byte_circuit, std::uint8_t special) {
  Traced("Trace: SendCommand", [&] {
    if (circuit >= kCircuitLimit) {
      XmitData(packet);
      log_.Append("Command-" + HexList(packet, '-'));
      return;
    }
    if (command_buffering_) {
      if (code >= kFirstBufferedCode && code <= kLastBufferedCode) {
        // Without a free slot the command is dropped, without an error.
        command_buffer_.Store(unit, circuit, {code, intensity, packet, two_byte_circuit, special});
        return;
      }
      command_buffer_.Clear(unit, circuit);
    }
    XmitData(packet);
  });
}

void HwSerial::XmitData(std::span<const std::uint8_t> packet) {
  sent_byte_count_ += static_cast<double>(packet.size()) - 1;
  if (block_collection_) {
    block_.insert(block_.end(), packet.begin(), packet.end());
    return;
  }
  OpenPort();
  if (!port_open_) return;
  if (PollOnLine()) {
    held_back_.pop_back();
    held_back_.insert(held_back_.end(), packet.begin(), packet.end());
    if (packet.back() != kFrameByte) held_back_.push_back(kFrameByte);
    return;
  }
  if (line_released_) TakeLineBack();
  device_.Write(packet);
  Trace([&] { return "Write[" + std::to_string(clock_.NowMs()) + "](" + HexList(packet, ',') + ")"; });
}

}  // namespace tendril
