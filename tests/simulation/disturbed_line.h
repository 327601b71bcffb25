// What lies between the program and the units, and what can go wrong there: bytes that get lost, come twice, come as
// others, come late, or come from nowhere.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <vector>

#include "bench/virtual_unit.h"
#include "platform/clock.h"
#include "platform/serial_device.h"
#include "platform/timer.h"
#include "simulation/random_source.h"

namespace tendril::test {

// How often what happened, by name.
using Counts = std::map<std::string, std::uint64_t>;

// One byte in so many suffers it; 0: none does.
struct Weather {
  std::uint32_t lost = 0;
  std::uint32_t doubled = 0;
  std::uint32_t altered = 0;
  std::uint32_t late = 0;  // on the way to the program: what follows is late too, as in an adapter's buffer
};

// Spoils bytes as the weather is, and counts what it did.
class Disturbance {
 public:
  Disturbance(RandomSource& random, Counts& counts) : random_(random), counts_(counts) {}

  struct Heard {
    Bytes bytes;  // in the place of the one that was sent
    bool damaged;
  };
  Heard Pass(std::uint8_t byte);
  // For how many milliseconds an adapter keeps what it receives; 0 as a rule.
  int LateMs();

  Weather weather;

 private:
  RandomSource& random_;
  Counts& counts_;
};

// A unit that hears the line through a disturbance.
class DisturbedUnit final : public LineUnit {
 public:
  // `accepted` is told of each configuration command that the unit accepts: its packet as the unit heard it, without
  // zero bytes, and whether that was damaged.
  using Accepted = std::function<void(const DisturbedUnit& unit, const Bytes& packet, bool damaged)>;

  DisturbedUnit(std::unique_ptr<VirtualUnit> unit, Disturbance& disturbance, Accepted accepted);

  std::vector<Transmission> Hear(std::uint8_t byte, std::uint64_t at_us) override;
  // What it hears, ahead of the next byte on the line.
  void AddNoise(const Bytes& noise);

  const VirtualUnit& unit() const { return *unit_; }
  // It accepted a command that no poll has asked about yet: its next acknowledgement speaks of that one.
  bool AcknowledgementDue() const { return acknowledgement_due_; }

 private:
  void HearOne(std::uint8_t byte, std::uint64_t at_us, bool damaged, std::vector<Transmission>& answers);

  std::unique_ptr<VirtualUnit> unit_;
  Disturbance& disturbance_;
  Accepted accepted_;
  Bytes noise_;
  Bytes packet_;  // as heard since the last zero byte
  bool damaged_ = false;
  bool acknowledgement_due_ = false;
};

// A serial device whose input goes through a disturbance.
class DisturbedDevice final : public SerialDevice {
 public:
  // Everything must outlive it. `written` is told of what the program writes, right after.
  DisturbedDevice(std::unique_ptr<SerialDevice> device, TimerFactory& timers, Disturbance& disturbance,
                  std::function<void(std::span<const std::uint8_t>)> written);

  void SetEventHandler(std::function<void(SerialEvent)> handler) override { handler_ = std::move(handler); }
  bool Exists(std::int32_t number) const override { return device_->Exists(number); }
  std::string Describe(std::int32_t number) const override { return device_->Describe(number); }
  void Open(std::int32_t number, std::int32_t baud) override;
  void Close() noexcept override;
  void SetReceiveThreshold(std::int32_t bytes) override;
  void SetRts(bool asserted) override;
  void Write(std::span<const std::uint8_t> bytes) override;
  Bytes ReadAll() override;
  void ClearInput() override;
  std::size_t PendingOutput() const override { return device_->PendingOutput(); }

  // Arrives at the program without ever having been on the line.
  void AddNoise(const Bytes& noise);

  bool IsOpen() const { return open_; }
  std::int32_t number() const { return number_; }
  bool rts() const { return rts_; }
  // What waited to go out when RTS was asserted last.
  std::size_t pending_when_taken_back() const { return pending_when_taken_back_; }
  // Something has been wrong with the input since ForgetDamage(), or some of it was late then.
  bool damaged() const { return damaged_; }
  void ForgetDamage() { damaged_ = !late_.empty(); }

 private:
  void OnEvent(SerialEvent event);
  void TakeIn();
  void Arrive(const Bytes& bytes);
  void Tell();

  std::unique_ptr<SerialDevice> device_;
  Disturbance& disturbance_;
  std::function<void(std::span<const std::uint8_t>)> written_;
  std::function<void(SerialEvent)> handler_;
  std::unique_ptr<Timer> timer_;
  std::int32_t receive_threshold_ = 0;
  std::int32_t number_ = 0;  // of the port that was opened last
  bool open_ = false;
  Bytes input_;
  Bytes late_;  // what the adapter has and does not give yet
  bool holding_ = false;
  bool untold_ = false;
  bool rts_ = false;
  std::size_t pending_when_taken_back_ = 0;
  bool damaged_ = false;
};

}  // namespace tendril::test
