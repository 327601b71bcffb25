// The requests of CommListenerInterface: what each carries, and in which order they go out.
#include <utility>

#include "commlistener/comm_listener_interface.h"
#include "platform/ansi_text.h"
#include "platform/runtime_error.h"
#include "platform/unicode.h"

namespace tendril {
namespace {

constexpr std::int32_t kGiveBack = 256;  // added to the port number in an entry of the port control queue

// Builds the data of a lighting record.
class LightingData {
 public:
  LightingData& Byte(std::uint8_t value) {
    bytes_.push_back(value);
    return *this;
  }
  LightingData& Word(std::uint16_t value) {
    return Byte(static_cast<std::uint8_t>(value & 0xFF)).Byte(static_cast<std::uint8_t>(value >> 8));
  }
  LightingData& Long(std::int32_t value) {
    const auto bits = static_cast<std::uint32_t>(value);
    return Word(static_cast<std::uint16_t>(bits & 0xFFFF)).Word(static_cast<std::uint16_t>(bits >> 16));
  }
  // The count, then that many of the values.
  LightingData& Counted(std::int16_t count, std::span<const std::uint8_t> values) {
    if (count < 0 || static_cast<std::size_t>(count) > values.size()) {
      throw RuntimeError(kErrOutOfRange, "Subscript out of range");
    }
    Word(static_cast<std::uint16_t>(count));
    bytes_.insert(bytes_.end(), values.begin(), values.begin() + count);
    return *this;
  }
  const Bytes& bytes() const { return bytes_; }

 private:
  Bytes bytes_;
};

}  // namespace

// Runs a request; a fault in it ends in `failure`.
template <typename Request>
void CommListenerInterface::Guarded(const char* failure, Request request) {
  try {
    request();
  } catch (...) {
    Fail(kCLIFault, failure);
  }
}

// Each step sends only when nothing is outstanding, so that at most one of them does.
void CommListenerInterface::WorkOffPendingRequests() {
  if (ReadyToTransmit() && std::exchange(physical_lights_pending_, false)) SendPhysicalLightsControl();
  if (client_identification_pending_) SendClientIdentification();
  if (all_off_on_disconnect_pending_) SendAllOffOnDisconnect();
  if (ReadyToTransmit() && !port_control_queue_.empty()) SendCommPortControl();
  if (ReadyToTransmit()) SendLightingData();
}

void CommListenerInterface::SetPhysicalLightsControl(bool control) {
  physical_lights_control_ = control;
  physical_lights_pending_ = true;
  WorkOffPendingRequests();
}

void CommListenerInterface::SendPhysicalLightsControl() {
  Guarded("Error in SendPhysicalLightsControl", [this] {
    const std::uint8_t payload[] = {static_cast<std::uint8_t>(physical_lights_control_ ? 1 : 0)};
    SendMessage('P', payload);
  });
}

void CommListenerInterface::SendClientIdentification() {
  if (!ReadyToTransmit()) return;
  Guarded("Error in SendClientIdentification", [this] {
    client_identification_pending_ = false;
    SendMessage('I', AnsiBytes(Utf16(client_identification_)));
  });
}

void CommListenerInterface::SendAllOffOnDisconnect() {
  if (!ReadyToTransmit()) return;
  Guarded("Error in SendAllOffOnDisconnect", [this] {
    all_off_on_disconnect_pending_ = false;
    SendMessage('A', {});
  });
}

void CommListenerInterface::RequestCommPortControl(std::uint8_t port) {
  port_control_[port] = PortControl::kAsked;
  QueueCommPortControl(port);
}

void CommListenerInterface::RelinquishCommPortControl(std::uint8_t port) {
  port_control_.erase(port);
  QueueCommPortControl(port + kGiveBack);
}

PortControl CommListenerInterface::CommPortControl(std::uint8_t port) const {
  const auto known = port_control_.find(port);
  return known != port_control_.end() ? known->second : PortControl::kNone;
}

// The outstanding request for a port, if there is one, has ended.
void CommListenerInterface::EndCommPortControl(PortControl outcome) {
  const auto entry = std::exchange(port_control_outstanding_, std::nullopt);
  if (!entry || *entry >= kGiveBack) return;
  const auto known = port_control_.find(static_cast<std::uint8_t>(*entry));
  if (known != port_control_.end()) known->second = outcome;
}

void CommListenerInterface::QueueCommPortControl(std::int32_t entry) {
  port_control_queue_.push_back(entry);
  WorkOffPendingRequests();
}

void CommListenerInterface::SendCommPortControl() {
  Guarded("Error in SendCommPortControl", [this] {
    const std::int32_t entry = port_control_queue_.front();
    port_control_queue_.pop_front();
    port_control_outstanding_ = entry;
    const std::uint8_t payload[] = {static_cast<std::uint8_t>(entry % kGiveBack),
                                    static_cast<std::uint8_t>(entry >= kGiveBack ? 1 : 0)};
    SendMessage('C', payload);
  });
}

void CommListenerInterface::SendLightingData() {
  if (const auto batch = lighting_.TakeBatch()) {
    SendMessage('L', *batch);
  } else if (!lighting_.buffer().empty()) {
    SendMessageB('L', lighting_.buffer(), lighting_.buffer().size());
    lighting_.ClearBuffer();
  }
}

void CommListenerInterface::QueueLighting(LightingRecordType type, std::span<const std::uint8_t> data) {
  lighting_.Append(type, data);
  WorkOffPendingRequests();
}

void CommListenerInterface::SendAllOffCommand() {
  Guarded("Error in SendAllOffCommand", [this] { QueueLighting(LightingRecordType::kAllOff, {}); });
}

void CommListenerInterface::SendDMXEffectForAddressCommand(std::uint16_t a, std::uint16_t b, std::uint8_t c,
                                                           std::uint8_t d, std::uint8_t e, std::int32_t f) {
  Guarded("Error in SendDMXEffectForAddressCommand", [=, this] {
    QueueLighting(LightingRecordType::kDMXEffectForAddress,
                  LightingData().Word(a).Word(b).Byte(c).Byte(d).Byte(e).Byte(0).Long(f).bytes());
  });
}

void CommListenerInterface::SendNyxEffectForCircuit(std::uint8_t a, std::uint8_t b, std::uint16_t c,
                                                    std::uint8_t d, std::uint8_t e, std::uint8_t f,
                                                    std::int32_t g) {
  Guarded("Error in SendNyxCommand", [=, this] {
    QueueLighting(LightingRecordType::kNyxEffectForCircuit,
                  LightingData().Byte(a).Byte(b).Word(c).Byte(d).Byte(e).Byte(f).Byte(0).Long(g).bytes());
  });
}

void CommListenerInterface::SendDMXIntensities(std::uint16_t a, std::uint16_t b, std::int16_t count,
                                               std::span<const std::uint8_t> values) {
  Guarded("Error in SendDMXIntensities", [=, this] {
    QueueLighting(LightingRecordType::kDMXIntensities,
                  LightingData().Word(a).Word(b).Counted(count, values).bytes());
  });
}

// A fault has the text of SendDMXIntensities.
void CommListenerInterface::SendNyxIntensities(std::uint8_t a, std::uint8_t b, std::uint16_t c,
                                               std::int16_t count, std::span<const std::uint8_t> values) {
  Guarded("Error in SendDMXIntensities", [=, this] {
    QueueLighting(LightingRecordType::kNyxIntensities,
                  LightingData().Byte(a).Byte(b).Word(c).Counted(count, values).bytes());
  });
}

}  // namespace tendril
