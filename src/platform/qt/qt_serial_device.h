// QtSerialDevice: the serial ports of this computer, served by Qt's event loop.
#pragma once

#include <QTimer>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <string>

#include "platform/bytes.h"
#include "platform/qt/mailbox.h"
#include "platform/qt/port_watch.h"
#include "platform/serial_device.h"
#include "platform/serial_port.h"

namespace tendril {

// Serves the ports that FindSerialDevice() finds. The owner may destroy the device inside an event.
class QtSerialDevice final : public SerialDevice {
 public:
  // `on_fault` gets failures of the event handler, `trace` a line of text about each problem with RTS.
  explicit QtSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace = {});
  ~QtSerialDevice() override;

  void SetEventHandler(std::function<void(SerialEvent)> handler) override;
  bool Exists(std::int32_t number) const override;
  DeviceDescription Describe(std::int32_t number) const override;
  PortHolder Holder(std::int32_t number) const override;
  void WatchPorts(const std::function<void()>& handler) override;
  void Open(std::int32_t number, std::int32_t baud) override;
  void Close() noexcept override;
  void SetReceiveThreshold(std::int32_t bytes) override;
  void SetRts(bool asserted) override;
  void Write(std::span<const std::uint8_t> bytes) override;
  Bytes ReadAll() override;
  void ClearInput() override;
  std::size_t PendingOutput() const override;

 private:
  SerialPort& OpenPort() const;
  // Moves up to `limit` bytes that have arrived into the input buffer; false when there are none.
  bool Receive(std::size_t limit);
  std::size_t Room() const { return kSerialInputBufferBytes - input_.size(); }
  void SendWaiting();
  void CheckForLoss();
  void TraceRts(const std::string& line);

  bool HasEnough() const;
  // Posts kDataReceived when as much waits as the threshold asks for.
  void PostIfEnough();
  void Deliver(SerialEvent event);

  std::function<void(const std::string&)> trace_;
  std::function<void(SerialEvent)> handler_;
  std::int32_t receive_threshold_ = 0;
  std::int32_t number_ = 0;  // of the port that was opened last
  bool rts_traced_ = false;  // since the port was opened
  std::unique_ptr<SerialPort> port_;
  Bytes input_;               // at most kSerialInputBufferBytes
  Bytes output_;              // accepted by Write(), and not taken by the system yet
  QTimer dead_device_check_;  // runs while the port is open

  // Posted and not delivered yet.
  bool data_posted_ = false;
  bool overflow_posted_ = false;
  bool loss_posted_ = false;
  Mailbox mailbox_;
  FaultHandler on_fault_;
  std::unique_ptr<PortWatch> watch_;  // null while the ports are not watched
};

}  // namespace tendril
