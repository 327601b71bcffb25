#include "platform/windows/serial_handle.h"

#include <windows.h>

#include <algorithm>
#include <array>
#include <optional>
#include <string>
#include <utility>

#include "platform/port_names.h"
#include "platform/runtime_error.h"
#include "platform/windows/overlapped_call.h"
#include "platform/windows/system_text.h"

namespace tendril {
namespace {

// What a driver is asked to keep in either direction, in bytes.
constexpr DWORD kDriverQueueBytes = 4096;

RuntimeError NoSuchDevice(const std::filesystem::path& device) {
  return {kErrInvalidPort, "There is no serial device at " + device.string() + "."};
}

RuntimeError WhyNotOpen(const std::filesystem::path& device, DWORD error) {
  switch (error) {
    case ERROR_FILE_NOT_FOUND:
    case ERROR_PATH_NOT_FOUND:
    case ERROR_DEV_NOT_EXIST:
    case ERROR_DEVICE_NOT_CONNECTED:
      return NoSuchDevice(device);
    case ERROR_ACCESS_DENIED:
    case ERROR_SHARING_VIOLATION:
    case ERROR_BUSY:
      return {kErrPortAlreadyOpen, device.string() + " is in use by another program."};
    default:
      return {kErrSettingsRefused, device.string() + " cannot be set up: " + SystemText(error) + "."};
  }
}

// 8 data bits, no parity, one stop bit, no handshaking, and no error that stops the line.
DCB LineSettings(DWORD baud) {
  DCB settings = {};
  settings.DCBlength = sizeof settings;
  settings.BaudRate = baud;
  settings.fBinary = TRUE;
  settings.fDtrControl = DTR_CONTROL_ENABLE;
  settings.fRtsControl = RTS_CONTROL_ENABLE;
  settings.XonChar = 0x11;  // drivers refuse two that are equal, also where they are not used
  settings.XoffChar = 0x13;
  settings.ByteSize = 8;
  settings.Parity = NOPARITY;
  settings.StopBits = ONESTOPBIT;
  return settings;
}

// What waits in the driver; nothing when the device has gone.
std::optional<COMSTAT> Queues(HANDLE port) {
  COMSTAT state = {};
  DWORD errors = 0;
  if (!ClearCommError(port, &errors, &state)) return std::nullopt;
  return state;
}

}  // namespace

void SerialHandle::Closer::operator()(Handle handle) const { CloseHandle(handle); }

SerialHandle::OpenHandle SerialHandle::Open(const std::filesystem::path& device) {
  const std::wstring name = L"\\\\.\\" + device.wstring();  // from COM10 on, the name alone is a file's
  const HANDLE port = CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr, OPEN_EXISTING,
                                  FILE_FLAG_OVERLAPPED, nullptr);
  if (port == INVALID_HANDLE_VALUE) throw WhyNotOpen(device, GetLastError());
  return OpenHandle(port);
}

SerialHandle::SerialHandle(const std::filesystem::path& device, std::int32_t baud)
    : device_(device),
      port_(Open(device)),
      read_(std::make_unique<OverlappedCall>()),
      write_(std::make_unique<OverlappedCall>()) {
  Configure(baud);
  PurgeComm(port_.get(), PURGE_RXCLEAR | PURGE_TXCLEAR);
  SetEvent(written());
  BeginRead();
}

SerialHandle::~SerialHandle() {
  CancelIoEx(port_.get(), nullptr);
  PurgeComm(port_.get(), PURGE_RXCLEAR | PURGE_TXCLEAR);
  port_.reset();
  for (auto* call : {&read_, &write_}) OverlappedCall::Abandon(std::move(*call));
}

void SerialHandle::Configure(std::int32_t baud) {
  DCB settings = LineSettings(static_cast<DWORD>(baud));
  // A call ends when all its bytes are moved; a read also 20 ms after a byte, when fewer come than the driver had counted.
  COMMTIMEOUTS limits = {20, 0, 0, 0, 0};
  SetupComm(port_.get(), kDriverQueueBytes, kDriverQueueBytes);  // a driver may have its own sizes
  if (SetCommState(port_.get(), &settings) && SetCommTimeouts(port_.get(), &limits)) return;
  const DWORD error = GetLastError();
  if (HungUp()) throw NoSuchDevice(device_);  // it has gone since it was opened
  throw RuntimeError(kErrSettingsRefused, device_.string() + " cannot be set to " + std::to_string(baud) +
                                              " bit/s: " + SystemText(error) + ".");
}

SerialHandle::Handle SerialHandle::arrived() const { return read_->event(); }
SerialHandle::Handle SerialHandle::written() const { return write_->event(); }

std::size_t SerialHandle::Read(std::span<std::uint8_t> buffer) {
  if (lost_) return 0;
  if (unread_.empty()) {
    const auto end = read_->TakeEnd(port_.get());
    if (!end) return 0;
    lost_ = end->error != ERROR_SUCCESS;
    unread_ = std::span(read_->bytes).first(end->bytes);
  }
  const std::size_t got = std::min(buffer.size(), unread_.size());
  std::copy_n(unread_.begin(), got, buffer.begin());
  unread_ = unread_.subspan(got);
  if (unread_.empty() && !lost_) BeginRead();
  return got;
}

// As much as is there; else the next byte. A driver need not know limits that would let one call do both.
void SerialHandle::BeginRead() {
  const DWORD size =
      std::clamp<DWORD>(Queues(port_.get()).value_or(COMSTAT{}).cbInQue, 1, sizeof read_->bytes);
  lost_ = read_->Begin([&](OVERLAPPED* record) {
    return ReadFile(port_.get(), read_->bytes.data(), size, nullptr, record);
  }) != ERROR_SUCCESS;
}

std::size_t SerialHandle::Write(std::span<const std::uint8_t> bytes) {
  const auto check = [this](DWORD error) {
    if (error == ERROR_SUCCESS) return;
    throw RuntimeError(kErrDeviceIo, device_.string() + " cannot be written to: " + SystemText(error) + ".");
  };
  if (write_->begun()) {
    const auto end = write_->TakeEnd(port_.get());
    if (!end) return 0;
    check(end->error);
  }
  if (bytes.empty()) return 0;
  in_write_ = std::min(bytes.size(), write_->bytes.size());
  std::copy_n(bytes.begin(), in_write_, write_->bytes.begin());
  check(write_->Begin([this](OVERLAPPED* record) {
    return WriteFile(port_.get(), write_->bytes.data(), static_cast<DWORD>(in_write_), nullptr, record);
  }));
  return in_write_;
}

// A driver may count the bytes of the write that it is at, or leave them out.
std::size_t SerialHandle::QueuedOutput() const {
  return std::max<std::size_t>(Queues(port_.get()).value_or(COMSTAT{}).cbOutQue,
                               write_->running() ? in_write_ : 0);
}

void SerialHandle::ClearInput() {
  PurgeComm(port_.get(), PURGE_RXCLEAR);
  std::array<std::uint8_t, sizeof(OverlappedCall::bytes)> dropped;  // what was read before
  (void)Read(dropped);
}

bool SerialHandle::SetRts(bool asserted) {
  if (EscapeCommFunction(port_.get(), asserted ? SETRTS : CLRRTS)) return true;
  const DWORD error = GetLastError();
  if (error == ERROR_NOT_SUPPORTED || error == ERROR_INVALID_FUNCTION) return false;
  throw RuntimeError(kErrDeviceIo, "RTS of " + device_.string() + " cannot be " +
                                       (asserted ? "asserted" : "cleared") + ": " + SystemText(error) + ".");
}

// Windows takes the name of a device away with it, also while the port is open.
bool SerialHandle::HungUp() const { return lost_ || !Queues(port_.get()) || !SerialDeviceExists(device_); }

}  // namespace tendril
