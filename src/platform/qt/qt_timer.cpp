#include "platform/qt/qt_timer.h"

#include <QPointer>
#include <QTimer>
#include <utility>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

#ifdef _WIN32
constexpr Qt::TimerType kInexact = Qt::CoarseTimer;
#else
constexpr Qt::TimerType kInexact = Qt::PreciseTimer;  // the other types fire up to 5 % early
#endif

class QtTimer final : public Timer {
 public:
  QtTimer(std::function<void()> on_tick, FaultHandler on_fault, bool exact)
      : tick_(std::make_shared<Tick>(Tick{std::move(on_tick), std::move(on_fault)})) {
    timer_.setTimerType(exact ? Qt::PreciseTimer : kInexact);
    QObject::connect(&timer_, &QTimer::timeout, &timer_, [this] { OnTimeout(); });
  }

  void SetInterval(std::int32_t ms) override {
    if (ms < 0) throw RuntimeError(kErrInvalidPropertyValue, "A timer's interval cannot be negative.");
    interval_ms_ = ms;
    BeginPeriod();
  }
  std::int32_t Interval() const override { return interval_ms_; }

  void SetEnabled(bool enabled) override {
    enabled_ = enabled;
    BeginPeriod();
  }
  bool Enabled() const override { return enabled_; }

 private:
  // Outlives a timer that its own tick destroys.
  struct Tick {
    std::function<void()> on_tick;
    FaultHandler on_fault;
    bool running = false;
  };

  void BeginPeriod() {
    if (enabled_ && interval_ms_ > 0) {
      timer_.start(interval_ms_);
    } else {
      timer_.stop();
    }
  }

  void OnTimeout() {
    // Qt does not let a timer tick inside its own tick, unless the tick starts a new period.
    if (tick_->running) return;

    const std::shared_ptr<Tick> tick = tick_;
    const QPointer<QTimer> alive = &timer_;
    tick->running = true;
    CallGuarded(
        [&](const std::string& description) {
          if (alive) SetEnabled(false);
          ReportFault(tick->on_fault, description);
        },
        tick->on_tick);
    tick->running = false;
  }

  std::shared_ptr<Tick> tick_;
  QTimer timer_;
  std::int32_t interval_ms_ = 0;
  bool enabled_ = false;
};

}  // namespace

std::unique_ptr<Timer> QtTimerFactory::CreateTimer(std::function<void()> on_tick) {
  return std::make_unique<QtTimer>(std::move(on_tick), on_fault_, exact_);
}

}  // namespace tendril
