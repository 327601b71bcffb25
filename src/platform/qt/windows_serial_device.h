// WindowsSerialDevice: the serial port on Windows, on QSerialPort.
#pragma once

#include <QSerialPort>
#include <QTimer>
#include <cstddef>
#include <functional>
#include <memory>
#include <string>

#include "platform/qt/serial_inbox.h"
#include "platform/serial_device.h"

namespace tendril {

// Windows opens every serial port for one program alone, and takes a port's name away with its device, even while the
// port is open.
class WindowsSerialDevice final : public SerialDevice {
 public:
  // As CreateSystemSerialDevice().
  WindowsSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace);
  ~WindowsSerialDevice() override;

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
  QSerialPort& OpenPort() const;
  void TakeArrived();
  void CheckForLoss();
  // Notes a fault of the RTS line, the first time after the port was opened.
  void TraceRts(const std::string& line);

  SerialInbox inbox_;
  std::function<void(const std::string&)> trace_;
  std::int32_t number_ = 0;  // of the port that was opened last
  std::unique_ptr<QSerialPort> port_;
  bool rts_traced_ = false;
  QTimer dead_device_check_;  // runs while the port is open
};

}  // namespace tendril
