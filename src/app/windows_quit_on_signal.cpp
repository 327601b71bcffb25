#include <windows.h>

#include <QObject>
#include <mutex>
#include <optional>
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

// Where a program uses user32.dll, and Qt does, the end of the session comes to its windows instead of the handler above:
// here to a window that is never shown, in a thread that ends with this object. A process that ends in the middle of a
// thread's call to user32.dll may hang.
class SessionWatch {
 public:
  ~SessionWatch() {
    ::SetEvent(over_);
    thread_.join();
    ::CloseHandle(over_);
  }

 private:
  static LRESULT CALLBACK OnMessage(HWND window, UINT message, WPARAM first, LPARAM second) {
    const bool session_ends = message == WM_ENDSESSION && first != 0;
    if (session_ends && DeliverRequest(kTerminate)) ::WaitForSingleObject(over_of_this_thread_, INFINITE);
    return ::DefWindowProcW(window, message, first, second);
  }

  void Run() {
    over_of_this_thread_ = over_;
    WNDCLASSW kind = {};
    kind.lpfnWndProc = OnMessage;
    kind.hInstance = ::GetModuleHandleW(nullptr);
    kind.lpszClassName = L"TendrilSession";
    ::RegisterClassW(&kind);  // fails when an earlier watch has done it
    const HWND window = ::CreateWindowExW(0, kind.lpszClassName, L"", 0, 0, 0, 0, 0, nullptr, nullptr,
                                          kind.hInstance, nullptr);
    while (::MsgWaitForMultipleObjects(1, &over_, FALSE, INFINITE, QS_ALLINPUT) == WAIT_OBJECT_0 + 1) {
      for (MSG message; ::PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE);) ::DispatchMessageW(&message);
    }
    ::DestroyWindow(window);
  }

  static thread_local HANDLE over_of_this_thread_;

  HANDLE over_ =
      ::CreateEventW(nullptr, TRUE, FALSE, nullptr);  // set when the program has done what it has to
  std::thread thread_{[this] { Run(); }};
};

thread_local HANDLE SessionWatch::over_of_this_thread_ = nullptr;

std::optional<SessionWatch> session_watch;  // none while there is no QuitOnSignal

// Once, and for good: to remove a handler waits for one that holds the process.
std::once_flag console_watch;

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
  std::call_once(console_watch, [] { ::SetConsoleCtrlHandler(OnConsoleEvent, TRUE); });
  session_watch.emplace();
}

QuitOnSignal::~QuitOnSignal() {
  {
    const std::lock_guard guard(request_lock);
    deliver_request = nullptr;
  }
  session_watch.reset();
}

}  // namespace tendril
