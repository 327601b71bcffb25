// SerialTerminal: an open serial port of Linux or macOS.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <span>

#include "platform/posix/serial_hold.h"
#include "platform/serial_port.h"

namespace tendril {

// A terminal device as a serial port; without the event loop that NotifyWritable() needs. A driver may make a call wait:
// that of a USB adapter which has stalled delays setting RTS, and closing while output is queued, for seconds.
class SerialTerminal : public SerialPort {
 public:
  // Opens `device` at `baud` bit/s; what had arrived before is dropped. Raises what SerialHold raises, and
  // kErrSettingsRefused when the device cannot do the speed.
  SerialTerminal(const std::filesystem::path& device, std::int32_t baud);
  // Restores the line settings that the device had.
  ~SerialTerminal() override;
  SerialTerminal(const SerialTerminal&) = delete;
  SerialTerminal& operator=(const SerialTerminal&) = delete;

  int descriptor() const { return hold_.descriptor(); }

  std::size_t Read(std::span<std::uint8_t> buffer) override;
  std::size_t Write(std::span<const std::uint8_t> bytes) override;
  std::size_t QueuedOutput() const override;
  void ClearInput() override;
  bool SetRts(bool asserted) override;
  bool HungUp() const override;

 private:
  struct Settings;

  explicit SerialTerminal(const std::filesystem::path& device);
  void Configure(std::int32_t baud);

  std::filesystem::path device_;
  SerialHold hold_;
  std::unique_ptr<Settings> before_;  // the settings that the device had; null before they are read
};

// The speed that a terminal device is set to, in bit/s; 0 when it is not known.
std::uint32_t LineSpeed(int descriptor);

}  // namespace tendril
