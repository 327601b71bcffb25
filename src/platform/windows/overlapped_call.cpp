#include "platform/windows/overlapped_call.h"

#include <utility>
#include <vector>

#include "platform/runtime_error.h"
#include "platform/windows/system_text.h"

namespace tendril {

OverlappedCall::OverlappedCall() {
  record_.hEvent = CreateEventW(nullptr, TRUE, FALSE, nullptr);
  if (record_.hEvent == nullptr) throw RuntimeError(kErrDeviceIo, SystemText(GetLastError()) + ".");
}

std::optional<OverlappedCall::End> OverlappedCall::TakeEnd(HANDLE device) {
  if (WaitForSingleObject(record_.hEvent, 0) != WAIT_OBJECT_0) return std::nullopt;
  End end;
  if (!GetOverlappedResult(device, &record_, &end.bytes, FALSE)) end.error = GetLastError();
  begun_ = false;
  return end;
}

void OverlappedCall::Abandon(std::unique_ptr<OverlappedCall> call) {
  static auto& abandoned = *new std::vector<std::unique_ptr<OverlappedCall>>;  // outlives main()
  std::erase_if(abandoned, [](const auto& earlier) { return !earlier->running(); });
  if (call->running()) abandoned.push_back(std::move(call));
}

}  // namespace tendril
