// SerialHandle: an open serial port of Windows.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <span>

#include "platform/serial_port.h"

namespace tendril {

class OverlappedCall;

// A serial port without the event loop that NotifyWritable() needs. The system reads and writes on its own; each of the two
// has an event, which stays set until the call that is due is made.
class SerialHandle : public SerialPort {
 public:
  using Handle = void*;

  // Opens `device` ("COM3") at `baud` bit/s, with DTR and RTS asserted; what had arrived before is dropped. Raises
  // kErrInvalidPort, kErrPortAlreadyOpen or kErrSettingsRefused.
  SerialHandle(const std::filesystem::path& device, std::int32_t baud);
  ~SerialHandle() override;
  SerialHandle(const SerialHandle&) = delete;
  SerialHandle& operator=(const SerialHandle&) = delete;

  // Set when Read() is due: bytes have arrived, or the device has gone.
  Handle arrived() const;
  // Set when Write() is due: what it has begun has ended.
  Handle written() const;
  // The device has gone, and the events stay as they are.
  bool lost() const { return lost_; }

  std::size_t Read(std::span<std::uint8_t> buffer) override;
  std::size_t Write(std::span<const std::uint8_t> bytes) override;
  std::size_t QueuedOutput() const override;
  void ClearInput() override;
  bool SetRts(bool asserted) override;
  bool HungUp() const override;

 private:
  struct Closer {
    void operator()(Handle handle) const;
  };
  using OpenHandle = std::unique_ptr<void, Closer>;

  static OpenHandle Open(const std::filesystem::path& device);
  void Configure(std::int32_t baud);
  // Has the system read what arrives next.
  void BeginRead();

  std::filesystem::path device_;
  OpenHandle port_;
  std::unique_ptr<OverlappedCall> read_, write_;
  std::span<const std::uint8_t> unread_;  // of what was read
  std::size_t in_write_ = 0;              // bytes
  bool lost_ = false;
};

}  // namespace tendril
