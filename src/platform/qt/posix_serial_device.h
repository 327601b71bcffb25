// PosixSerialDevice: the serial port on Linux and macOS.
#pragma once

#include <QSocketNotifier>
#include <QTimer>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>

#include "platform/posix/serial_terminal.h"
#include "platform/qt/serial_inbox.h"
#include "platform/serial_device.h"

namespace tendril {

// A SerialTerminal, served by the event loop.
class PosixSerialDevice final : public SerialDevice {
 public:
  // As CreateSystemSerialDevice().
  PosixSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace);
  ~PosixSerialDevice() override;

  void SetEventHandler(std::function<void(SerialEvent)> handler) override;
  bool Exists(std::int32_t number) const override;
  std::string Describe(std::int32_t number) const override;
  void Open(std::int32_t number, std::int32_t baud) override;
  void Close() noexcept override;
  void SetReceiveThreshold(std::int32_t bytes) override;
  void SetRts(bool asserted) override;
  void Write(std::span<const std::uint8_t> bytes) override;
  Bytes ReadAll() override;
  void ClearInput() override;
  std::size_t PendingOutput() const override;

 private:
  // The open port.
  struct Port {
    Port(const std::filesystem::path& device, std::int32_t baud);

    SerialTerminal terminal;
    QSocketNotifier readable;
    QSocketNotifier writable;  // enabled while output waits
    Bytes output;              // accepted by Write(), and not taken by the system yet
  };

  Port& OpenPort() const;
  // Moves up to `limit` bytes that have arrived into the inbox; false when there are none.
  bool Receive(std::size_t limit);
  void SendWaiting();
  void CheckForLoss();
  // Notes a fault of the RTS line, the first time after the port was opened.
  void TraceRts(const std::string& line);

  SerialInbox inbox_;
  std::function<void(const std::string&)> trace_;
  std::int32_t number_ = 0;  // of the port that was opened last
  std::unique_ptr<Port> port_;
  bool rts_traced_ = false;
  QTimer dead_device_check_;  // runs while the port is open
};

}  // namespace tendril
