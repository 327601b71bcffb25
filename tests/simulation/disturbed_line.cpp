#include "simulation/disturbed_line.h"

#include <utility>

namespace tendril::test {
namespace {

constexpr std::size_t kLongestPacket = 64;
constexpr int kLatestMs = 60;

}  // namespace

Disturbance::Heard Disturbance::Pass(std::uint8_t byte) {
  if (random_.OneIn(weather.lost)) {
    ++counts_["bytes lost"];
    return {{}, true};
  }
  if (random_.OneIn(weather.doubled)) {
    ++counts_["bytes doubled"];
    return {{byte, byte}, true};
  }
  if (random_.OneIn(weather.altered)) {
    ++counts_["bytes altered"];
    return {{static_cast<std::uint8_t>(byte ^ (1 + random_.Below(255)))}, true};
  }
  return {{byte}, false};
}

int Disturbance::LateMs() {
  if (!random_.OneIn(weather.late)) return 0;
  ++counts_["late input"];
  return random_.Between(1, kLatestMs);
}

DisturbedUnit::DisturbedUnit(std::unique_ptr<VirtualUnit> unit, Disturbance& disturbance, Accepted accepted)
    : unit_(std::move(unit)), disturbance_(disturbance), accepted_(std::move(accepted)) {}

std::vector<Transmission> DisturbedUnit::Hear(std::uint8_t byte, std::uint64_t at_us) {
  std::vector<Transmission> answers;
  for (const std::uint8_t noise : std::exchange(noise_, {})) HearOne(noise, at_us, true, answers);
  const Disturbance::Heard heard = disturbance_.Pass(byte);
  for (const std::uint8_t each : heard.bytes) HearOne(each, at_us, heard.damaged, answers);
  damaged_ = damaged_ || heard.damaged;  // also of the packet that an altered zero began
  return answers;
}

void DisturbedUnit::AddNoise(const Bytes& noise) { noise_.insert(noise_.end(), noise.begin(), noise.end()); }

void DisturbedUnit::HearOne(std::uint8_t byte, std::uint64_t at_us, bool damaged,
                            std::vector<Transmission>& answers) {
  const std::size_t accepted_before = unit_->accepted_commands();
  const auto said = unit_->Hear(byte, at_us);
  answers.insert(answers.end(), said.begin(), said.end());
  damaged_ = damaged_ || damaged;
  if (byte != 0) {
    if (packet_.size() < kLongestPacket) packet_.push_back(byte);
    return;
  }
  if (packet_.size() > 2 && packet_[1] == 0x88 && packet_[2] == '0' && !said.empty())
    acknowledgement_due_ = false;
  if (unit_->accepted_commands() != accepted_before) {
    acknowledgement_due_ = true;
    accepted_(*this, packet_, damaged_);
  }
  packet_.clear();
  damaged_ = false;
}

DisturbedDevice::DisturbedDevice(std::unique_ptr<SerialDevice> device, TimerFactory& timers,
                                 Disturbance& disturbance,
                                 std::function<void(std::span<const std::uint8_t>)> written)
    : device_(std::move(device)),
      disturbance_(disturbance),
      written_(std::move(written)),
      timer_(timers.CreateTimer([this] {
        timer_->SetEnabled(false);
        holding_ = false;
        Arrive(std::exchange(late_, {}));
        Tell();
      })) {
  device_->SetEventHandler([this](SerialEvent event) { OnEvent(event); });
  device_->SetReceiveThreshold(1);
}

void DisturbedDevice::Open(std::int32_t number, std::int32_t baud) {
  device_->Open(number, baud);
  number_ = number;
  open_ = true;
}

void DisturbedDevice::Close() noexcept {
  device_->Close();
  timer_->SetEnabled(false);
  input_.clear();
  late_.clear();
  open_ = holding_ = untold_ = rts_ = false;
}

void DisturbedDevice::SetReceiveThreshold(std::int32_t bytes) {
  receive_threshold_ = bytes;
  untold_ = !input_.empty();
  if (!untold_ || holding_) return;
  timer_->SetInterval(1);  // from the event loop, not from here
  timer_->SetEnabled(true);
}

void DisturbedDevice::SetRts(bool asserted) {
  if (asserted) pending_when_taken_back_ = device_->PendingOutput();
  device_->SetRts(asserted);
  rts_ = asserted;
}

void DisturbedDevice::Write(std::span<const std::uint8_t> bytes) {
  device_->Write(bytes);
  written_(bytes);
}

Bytes DisturbedDevice::ReadAll() {
  TakeIn();
  untold_ = false;
  return std::exchange(input_, {});
}

void DisturbedDevice::ClearInput() {
  TakeIn();
  untold_ = false;
  input_.clear();
}

void DisturbedDevice::AddNoise(const Bytes& noise) {
  if (!open_) return;
  damaged_ = true;
  Arrive(noise);
  SetReceiveThreshold(receive_threshold_);
}

void DisturbedDevice::OnEvent(SerialEvent event) {
  switch (event) {
    case SerialEvent::kDataReceived:
      TakeIn();
      Tell();
      break;
    case SerialEvent::kDeviceLost:
      Close();
      if (handler_) handler_(event);
      break;
    case SerialEvent::kReceiveOverflow:
      if (handler_) handler_(event);
      break;
  }
}

// From the line into the adapter, and on to the input unless the adapter keeps it.
void DisturbedDevice::TakeIn() {
  for (const std::uint8_t byte : device_->ReadAll()) {
    if (const int late_ms = holding_ ? 0 : disturbance_.LateMs(); late_ms > 0) {
      holding_ = true;
      timer_->SetInterval(late_ms);
      timer_->SetEnabled(true);
    }
    const Disturbance::Heard heard = disturbance_.Pass(byte);
    damaged_ = damaged_ || heard.damaged;
    if (holding_) {
      late_.insert(late_.end(), heard.bytes.begin(), heard.bytes.end());
    } else {
      Arrive(heard.bytes);
    }
  }
}

void DisturbedDevice::Arrive(const Bytes& bytes) {
  for (const std::uint8_t byte : bytes) {
    if (input_.size() < kSerialInputBufferBytes) input_.push_back(byte);
    untold_ = true;
  }
}

void DisturbedDevice::Tell() {
  if (!untold_ || receive_threshold_ == 0 || input_.size() < static_cast<std::size_t>(receive_threshold_)) {
    return;
  }
  untold_ = false;
  if (handler_) handler_(SerialEvent::kDataReceived);
}

}  // namespace tendril::test
