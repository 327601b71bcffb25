// RecordingDevice: a serial port that records what is done to it and receives what a test hands it.
#pragma once

#include <functional>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "platform/runtime_error.h"
#include "platform/serial_device.h"

namespace tendril::test {

class RecordingDevice final : public SerialDevice {
 public:
  void SetEventHandler(std::function<void(SerialEvent)> handler) override { handler_ = std::move(handler); }
  bool Exists(std::int32_t number) const override { return number == 1 || number == 3; }
  DeviceDescription Describe(std::int32_t /*number*/) const override { return {}; }
  void Open(std::int32_t number, std::int32_t baud) override {
    if (open_failure) throw RuntimeError(*open_failure);
    actions.push_back("open " + std::to_string(number) + " at " + std::to_string(baud));
    open = true;
  }
  void Close() noexcept override {
    if (open) actions.push_back("close");
    open = false;
    input.clear();
  }
  void SetReceiveThreshold(std::int32_t bytes) override { receive_threshold = bytes; }
  void SetRts(bool asserted) override {
    RequireOpen();
    if (rts_failure) throw RuntimeError(*rts_failure);
    rts = asserted;
    actions.push_back(asserted ? "rts on" : "rts off");
  }
  void Write(std::span<const std::uint8_t> bytes) override {
    RequireOpen();
    if (write_failure) throw RuntimeError(*write_failure);
    writes.emplace_back(bytes.begin(), bytes.end());
  }
  Bytes ReadAll() override {
    RequireOpen();
    return std::exchange(input, {});
  }
  void ClearInput() override { input.clear(); }
  std::size_t PendingOutput() const override { return pending_output; }

  // `bytes` arrive; with `report` false without an event yet.
  void Receive(const Bytes& bytes, bool report = true) {
    input.insert(input.end(), bytes.begin(), bytes.end());
    if (report) handler_(SerialEvent::kDataReceived);
  }
  void Raise(SerialEvent event) { handler_(event); }
  // Takes what was written since the last call, write by write.
  std::vector<Bytes> TakeWrites() { return std::exchange(writes, {}); }
  std::vector<std::string> TakeActions() { return std::exchange(actions, {}); }

  std::vector<std::string> actions;
  std::vector<Bytes> writes;
  Bytes input;
  bool open = false;
  bool rts = false;
  std::int32_t receive_threshold = -1;
  std::size_t pending_output = 0;
  std::optional<RuntimeError> open_failure;
  std::optional<RuntimeError> write_failure;
  std::optional<RuntimeError> rts_failure;

 private:
  void RequireOpen() const {
    if (!open) throw RuntimeError(kErrPortNotOpen, "The port is not open");
  }

  std::function<void(SerialEvent)> handler_;
};

}  // namespace tendril::test
