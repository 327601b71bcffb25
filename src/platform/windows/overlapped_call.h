// OverlappedCall: a call of Windows that goes on after it has returned.
#pragma once

#include <windows.h>

#include <array>
#include <cstdint>
#include <memory>
#include <optional>

namespace tendril {

// One call at a time on a device, with all that the system writes to until the call has ended.
class OverlappedCall {
 public:
  struct End {
    DWORD error = ERROR_SUCCESS;
    DWORD bytes = 0;  // that were moved
  };

  // Raises kErrDeviceIo when the system has no event left.
  OverlappedCall();
  ~OverlappedCall() { CloseHandle(record_.hEvent); }
  OverlappedCall(const OverlappedCall&) = delete;
  OverlappedCall& operator=(const OverlappedCall&) = delete;

  // Set by the system when the call has ended.
  HANDLE event() const { return record_.hEvent; }
  // It was begun, and its end not taken.
  bool begun() const { return begun_; }
  // The system uses this object.
  bool running() const { return begun_ && !HasOverlappedIoCompleted(&record_); }

  // Begins `call`, which gets the record; returns why the system refuses it.
  template <typename Call>
  DWORD Begin(const Call& call) {
    begun_ = call(&record_) || GetLastError() == ERROR_IO_PENDING;
    return begun_ ? ERROR_SUCCESS : GetLastError();
  }
  // The end of the call that was begun on `device`; nothing while it goes on.
  std::optional<End> TakeEnd(HANDLE device);

  // Destroys `call`, but not before the system has left it. `call` must be cancelled. For one thread.
  static void Abandon(std::unique_ptr<OverlappedCall> call);

  std::array<std::uint8_t, 4096> bytes;  // what a read or a write moves

 private:
  OVERLAPPED record_ = {};
  bool begun_ = false;
};

}  // namespace tendril
