// QtSerialDevice: the serial port, on QSerialPort.
#pragma once

#include <QObject>
#include <QSerialPort>
#include <QTimer>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "platform/qt/fault_handler.h"
#include "platform/serial_device.h"
#include "platform/serial_hold.h"

namespace tendril {

// QSerialPort's signals never reach the owner: they only note what happened, and the event loop tells it
// later. So reception goes on while the owner shows a box, and the owner may do to the device what it likes
// inside an event, destroy it too.
//
// A device that goes away counts as open until kDeviceLost is told; until then writing goes nowhere and
// what had arrived can be read. QSerialPort reports no errors of single bytes, so kLineError never comes.
class QtSerialDevice final : public SerialDevice {
 public:
  // `on_fault` is told of failures in the event handler, `trace` of what a support person may want to know.
  explicit QtSerialDevice(FaultHandler on_fault, std::function<void(const std::string&)> trace = {});
  ~QtSerialDevice() override;

  void SetEventHandler(std::function<void(SerialEvent)> handler) override;
  bool Exists(std::int32_t number) const override;
  std::string Describe(std::int32_t number) const override;

  // Also raises kErrSettingsRefused for anything but no parity, 8 data bits and 1 stop bit. On an open port
  // the speed changes at once.
  void SetSettings(const std::string& settings) override;
  void SetPortNumber(std::int32_t number) override;
  // Raises kErrSettingsRefused for options that this device does not do: handshaking, text input, dropped
  // zero bytes, events on transmit, an input buffer without room. The sizes count from now on, also on an
  // open port.
  void SetLineOptions(const LineOptions& options) override;

  void Open() override;
  void Close() noexcept override;
  bool IsOpen() const override { return port_ != nullptr; }

  // When enough bytes wait already, kDataReceived comes for them. Raises kErrInvalidPropertyValue below 0.
  void SetReceiveThreshold(std::int32_t bytes) override;
  // Raises kErrInvalidPropertyValue unless 0: there is no event on transmit.
  void SetTransmitThreshold(std::int32_t bytes) override;

  void SetRts(bool asserted) override;
  void Write(std::span<const std::uint8_t> bytes) override;
  // At most as much as the input buffer takes; the rest stays for the next call.
  Bytes ReadAll() override;
  void ClearInput() override;
  std::size_t PendingOutput() const override;

 private:
  void RequireOpen() const;
  // Opens `port` and raises what went wrong in the words of a user.
  void OpenOrExplain(QSerialPort& port, const std::filesystem::path& device) const;

  // What QSerialPort signals.
  void TakeArrived();
  void OnError(QSerialPort::SerialPortError error);

  // Notes that the device is gone: the line is dead from here on.
  void NoteLoss();
  bool EnoughWaits() const;
  // Notes kDataReceived when as much waits as the threshold asks for.
  void NoteWaiting();
  void PostDelivery();
  // The next of the things that were noted, data before an overflow before a loss.
  std::optional<SerialEvent> TakeNextEvent();
  // Tells the owner of one event and sees to it that the others follow.
  void DeliverNext();

  std::function<void(SerialEvent)> handler_;
  FaultHandler on_fault_;
  std::function<void(const std::string&)> trace_;

  std::int32_t port_number_ = 0;   // 0: none chosen
  std::int32_t baud_rate_ = 9600;  // as in a fresh port
  LineOptions options_;

  // Both there while the port is open. The claim comes first and goes last.
  std::unique_ptr<SerialHold> hold_;
  std::unique_ptr<QSerialPort> port_;
  QTimer dead_device_check_;  // runs only while the port is open

  Bytes input_;  // at most options_.input_buffer_size
  bool rts_missing_ = false;

  // Noted and not told yet.
  bool data_noted_ = false;
  bool overflow_noted_ = false;
  bool loss_noted_ = false;
  bool delivery_posted_ = false;

  QObject context_;  // what is connected and posted ends with this object
};

}  // namespace tendril
