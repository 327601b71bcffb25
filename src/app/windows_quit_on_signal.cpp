#include <windows.h>

#include <QObject>
#include <mutex>
#include <thread>
#include <utility>

#include "app/quit_on_signal.h"

namespace tendril {
namespace {

constexpr int kHangUp = 1;
constexpr int kInterrupt = 2;
constexpr int kTerminate = 15;

// Requests come in threads of the system.
std::mutex request_lock;
std::function<void(int)> deliver_request;  // empty while there is no QuitOnSignal

// False: the system's own way is to be gone.
bool DeliverRequest(int signal) {
  const std::lock_guard guard(request_lock);
  if (!deliver_request) return false;
  deliver_request(signal);
  return true;
}

// The system ends the process as soon as its handler returns: the event loop gets the time that there is, some seconds,
// for what the end of the program needs.
[[noreturn]] void HoldProcess() {
  for (;;) ::Sleep(INFINITE);
}

BOOL WINAPI OnConsoleEvent(DWORD event) {
  if (event == CTRL_C_EVENT || event == CTRL_BREAK_EVENT) return DeliverRequest(kInterrupt);
  if (!DeliverRequest(event == CTRL_CLOSE_EVENT ? kHangUp : kTerminate)) return FALSE;
  HoldProcess();
}

LRESULT CALLBACK OnWindowMessage(HWND window, UINT message, WPARAM first, LPARAM second) {
  const bool session_ends = message == WM_ENDSESSION && first != 0;
  if (session_ends && DeliverRequest(kTerminate)) HoldProcess();
  return ::DefWindowProcW(window, message, first, second);
}

// Where a program uses user32.dll, and Qt does, the end of the session comes to its windows instead. This one is never
// shown, and lives as long as the process.
void WatchSession() {
  WNDCLASSW kind = {};
  kind.lpfnWndProc = OnWindowMessage;
  kind.hInstance = ::GetModuleHandleW(nullptr);
  kind.lpszClassName = L"TendrilSession";
  if (::RegisterClassW(&kind) == 0) return;  // there is one already
  std::thread([instance = kind.hInstance, name = kind.lpszClassName] {
    ::CreateWindowExW(0, name, L"", 0, 0, 0, 0, 0, nullptr, nullptr, instance, nullptr);
    MSG message;
    while (::GetMessageW(&message, nullptr, 0, 0) > 0) ::DispatchMessageW(&message);
  }).detach();
}

// The calling thread, for others.
HANDLE ThisThread() {
  HANDLE thread = nullptr;
  ::DuplicateHandle(::GetCurrentProcess(), ::GetCurrentThread(), ::GetCurrentProcess(), &thread, 0, FALSE,
                    DUPLICATE_SAME_ACCESS);
  return thread;
}

}  // namespace

class QuitOnSignal::Delivery {
 public:
  explicit Delivery(std::function<void(int)> handler) : handler_(std::move(handler)) {}
  ~Delivery() { ::CloseHandle(main_thread_); }
  Delivery(const Delivery&) = delete;
  Delivery& operator=(const Delivery&) = delete;

  void Deliver(int signal) {
    QMetaObject::invokeMethod(
        &context_, [this, signal] { handler_(signal); }, Qt::QueuedConnection);
    ::CancelSynchronousIo(main_thread_);  // it may wait for a reader that stands still
  }

 private:
  std::function<void(int)> handler_;
  HANDLE main_thread_ = ThisThread();
  QObject context_;
};

QuitOnSignal::QuitOnSignal(std::function<void(int)> handler)
    : delivery_(std::make_unique<Delivery>(std::move(handler))) {
  {
    const std::lock_guard guard(request_lock);
    deliver_request = [this](int signal) { delivery_->Deliver(signal); };
  }
  ::SetConsoleCtrlHandler(OnConsoleEvent, TRUE);
  WatchSession();
}

QuitOnSignal::~QuitOnSignal() {
  ::SetConsoleCtrlHandler(OnConsoleEvent, FALSE);
  const std::lock_guard guard(request_lock);
  deliver_request = nullptr;
}

}  // namespace tendril
