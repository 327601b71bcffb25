#include "app/bench_panel.h"

#include <span>
#include <utility>

#include "bench/printers.h"
#include "platform/runtime_error.h"
#include "platform/serial_device.h"

namespace tendril {
namespace {

constexpr int kRetryMs = 500;

}  // namespace

BenchPanel::BenchPanel(const BenchPanelOptions& options, const PseudoTerminal& terminal, TimerFactory& timers,
                       std::function<void(const std::string&)> print)
    : terminal_(terminal),
      comm_port_(CommName(options.comm_port)),
      print_(std::move(print)),
      panel_(timers),
      server_(panel_, options.tcp_port,
              [this](const std::string& sentence) {
                if (now_us_) Note(sentence);
              }),
      hold_(std::make_unique<SerialHold>(terminal.device())) {
  panel_.AddPort(options.comm_port);
  panel_.SetPortHandler([this](std::uint8_t /*port*/, bool held) { SetHeld(held); });
  if (options.behaviour != nullptr) {
    panel_.SetBehaviour(options.behaviour->behaviour, options.misbehaving_replies);
  }
  retry_.setInterval(kRetryMs);
  QObject::connect(&retry_, &QTimer::timeout, &retry_, [this] { TakeBack(); });
}

void BenchPanel::ShowConnections(std::function<std::uint64_t()> now_us) {
  now_us_ = std::move(now_us);
  panel_.SetTap([this](PanelSide from, std::span<const std::uint8_t> bytes) {
    print_(PrintPanelBytes(now_us_(), from, bytes));
  });
}

void BenchPanel::SetHeld(bool held) {
  if (held) return TakeBack();
  retry_.stop();
  if (!hold_) return;
  hold_.reset();
  terminal_.ForgetClosings();
  Note("The Control Panel has given " + comm_port_ + " up.");
}

void BenchPanel::TakeBack() {
  try {
    hold_ = std::make_unique<SerialHold>(terminal_.device());
  } catch (const RuntimeError& fault) {
    if (!retry_.isActive()) {
      Note("The Control Panel cannot take " + comm_port_ + " back yet: " + fault.description());
      retry_.start();
    }
    return;
  }
  retry_.stop();
  Note("The Control Panel holds " + comm_port_ + " again.");
}

}  // namespace tendril
