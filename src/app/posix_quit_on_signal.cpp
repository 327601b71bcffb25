#include <unistd.h>

#include <QSocketNotifier>
#include <array>
#include <cerrno>
#include <csignal>
#include <system_error>
#include <utility>

#include "app/quit_on_signal.h"

namespace tendril {
namespace {

constexpr std::array kSignals{SIGINT, SIGTERM, SIGHUP};

// A signal handler can reach no member.
std::array<int, 2> wake_pipe{-1, -1};

int OpenPipe() {
  if (::pipe(wake_pipe.data()) != 0) throw std::system_error(errno, std::generic_category());
  return wake_pipe[0];
}

}  // namespace

class QuitOnSignal::Delivery {
 public:
  explicit Delivery(std::function<void(int)> handler) : notifier_(OpenPipe(), QSocketNotifier::Read) {
    QObject::connect(&notifier_, &QSocketNotifier::activated, &notifier_, [handler = std::move(handler)] {
      char signal = 0;
      (void)!::read(wake_pipe[0], &signal, 1);  // the application may go on for a while
      handler(signal);
    });
  }

 private:
  QSocketNotifier notifier_;
};

QuitOnSignal::QuitOnSignal(std::function<void(int)> handler)
    : delivery_(std::make_unique<Delivery>(std::move(handler))) {
  struct sigaction action = {};
  action.sa_handler = [](int signal) {
    const char number = static_cast<char>(signal);
    (void)!::write(wake_pipe[1], &number, 1);
  };
  for (const int signal : kSignals) {
    struct sigaction before = {};
    ::sigaction(signal, nullptr, &before);
    if (before.sa_handler != SIG_IGN) ::sigaction(signal, &action, nullptr);
  }
}

QuitOnSignal::~QuitOnSignal() {
  for (const int signal : kSignals) {
    struct sigaction now = {};
    ::sigaction(signal, nullptr, &now);
    if (now.sa_handler != SIG_IGN) std::signal(signal, SIG_DFL);
  }
  for (const int descriptor : wake_pipe) ::close(descriptor);
}

}  // namespace tendril
