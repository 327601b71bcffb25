// CountingDevice: a serial device that counts what passes through it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <span>
#include <string>
#include <utility>

#include "platform/serial_device.h"

namespace tendril::test {

// Hands everything on to another device. On an echoing line the bytes that come in are all bytes on the wire,
// each once.
class CountingDevice final : public SerialDevice {
 public:
  // `device` must outlive this object.
  explicit CountingDevice(SerialDevice& device) : device_(device) {}

  void SetEventHandler(std::function<void(SerialEvent)> handler) override {
    device_.SetEventHandler(std::move(handler));
  }
  bool Exists(std::int32_t number) const override { return device_.Exists(number); }
  DeviceDescription Describe(std::int32_t number) const override { return device_.Describe(number); }
  void Open(std::int32_t number, std::int32_t baud) override { device_.Open(number, baud); }
  void Close() noexcept override { device_.Close(); }
  void SetReceiveThreshold(std::int32_t bytes) override { device_.SetReceiveThreshold(bytes); }
  void SetRts(bool asserted) override { device_.SetRts(asserted); }
  void Write(std::span<const std::uint8_t> bytes) override {
    sent += bytes.size();
    if (on_write) on_write(bytes);
    device_.Write(bytes);
  }
  Bytes ReadAll() override {
    Bytes bytes = device_.ReadAll();
    received += bytes.size();
    return bytes;
  }
  void ClearInput() override { received += device_.ReadAll().size(); }
  std::size_t PendingOutput() const override {
    const std::size_t pending = device_.PendingOutput();
    pended += pending;
    return pending;
  }

  std::size_t sent = 0;
  std::size_t received = 0;
  mutable std::size_t pended = 0;  // the sum of what PendingOutput() has returned
  std::function<void(std::span<const std::uint8_t>)>
      on_write;  // called with each packet before it is written

 private:
  SerialDevice& device_;
};

}  // namespace tendril::test
