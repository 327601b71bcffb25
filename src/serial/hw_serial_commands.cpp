// HwSerial's configuration commands, and the way of all packets to the line.
#include <algorithm>

#include "platform/hex_text.h"
#include "platform/runtime_error.h"
#include "serial/hw_serial.h"
#include "serial/light_packets.h"
#include "serial/packets.h"

namespace tendril {
namespace {

constexpr std::int16_t kUnitWide = 32767;
// Circuits from here on are not light circuits: their commands are sent at once and logged.
constexpr std::int16_t kCircuitLimit = 1024;
constexpr std::uint8_t kFirstBufferedCode = kCodeSetIntensity;
constexpr std::uint8_t kLastBufferedCode = kCodeDmxIntensity;
constexpr std::size_t kMaxMoreOptions = 25;
// The kind of the poll that may follow a change of the ID.
constexpr std::uint8_t kPollAfterSetAddress = 2;

}  // namespace

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
  cmdSetManyOptions(unit, circuit, b1, b2, b3, b4, b5, {});
}

void HwSerial::cmdSetManyOptions(std::uint8_t unit, std::int16_t circuit, std::uint8_t b1, std::uint8_t b2,
                                 std::uint8_t b3, std::uint8_t b4, std::uint8_t b5,
                                 std::span<const std::uint8_t> more) {
  // The trace line of both option commands is the fade's: that is how support knows them.
  Traced("Trace: Fade", [&] {
    if (more.size() > kMaxMoreOptions) throw RuntimeError(kErrOutOfRange, "Too many option bytes");
    OpenPort();
    SendUnlockCmd(unit);
    Bytes body{b1, b2, b3, b4, b5};
    body.insert(body.end(), more.begin(), std::find(more.begin(), more.end(), 0));
    SendCommand(unit, circuit, kCodeSetOption, kNoIntensity,
                BuildChecksummedPacket(unit, kCodeSetOption, body));
  });
}

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
  if (port_open_) line_.Write(packet);
}

}  // namespace tendril
