#include "bench/virtual_ports.h"

#include <algorithm>
#include <limits>
#include <optional>
#include <stdexcept>

#include "platform/runtime_error.h"

namespace tendril {
namespace {

constexpr std::int32_t kChangeReportMs = 1000;

RuntimeError Fault(std::int32_t number, std::string description) {
  return RuntimeError(number, std::move(description), "Serial port");
}

}  // namespace

// Calls back once after a time. It does so even when an earlier call has not returned, because a message box
// runs the event loop in it: a timer would not tick then, so another one is taken.
class VirtualPorts::Alarm {
 public:
  Alarm(TimerFactory& timers, std::function<void()> on_alarm)
      : timers_(timers), on_alarm_(std::move(on_alarm)) {}

  void Set(std::int32_t ms) {
    Clear();
    const auto free =
        std::find_if(slots_.begin(), slots_.end(), [](const auto& slot) { return !slot->ticking; });
    armed_ = free != slots_.end() ? free->get() : &AddSlot();
    armed_->timer->SetInterval(ms);
    armed_->timer->SetEnabled(true);
  }

  void Clear() {
    if (armed_ != nullptr) armed_->timer->SetEnabled(false);
    armed_ = nullptr;
  }

 private:
  struct Slot {
    std::unique_ptr<Timer> timer;
    bool ticking = false;
  };
  struct Ticking {
    explicit Ticking(Slot& ticking_slot) : slot(ticking_slot) { slot.ticking = true; }
    ~Ticking() { slot.ticking = false; }
    Slot& slot;
  };

  Slot& AddSlot() {
    Slot& slot = *slots_.emplace_back(std::make_unique<Slot>());
    slot.timer = timers_.CreateTimer([this, &slot] {
      const Ticking ticking(slot);
      Clear();
      on_alarm_();
    });
    return slot;
  }

  TimerFactory& timers_;
  std::function<void()> on_alarm_;
  std::vector<std::unique_ptr<Slot>> slots_;
  Slot* armed_ = nullptr;
};

struct VirtualPorts::Port {
  explicit Port(const VirtualLineOptions& options) : line(options) {}

  VirtualLine line;
  std::vector<std::unique_ptr<LineUnit>> units;
  bool plugged_in = true;
  bool held_by_another = false;
  PortHolder holder;
  bool allowed = true;
  Device* opener = nullptr;
};

class VirtualPorts::Device final : public SerialDevice {
 public:
  explicit Device(VirtualPorts& ports) : ports_(ports) { ports_.devices_.push_back(this); }
  ~Device() override {
    Close();
    std::erase(ports_.devices_, this);
  }

  void SetEventHandler(std::function<void(SerialEvent)> handler) override { handler_ = std::move(handler); }
  bool Exists(std::int32_t number) const override;
  DeviceDescription Describe(std::int32_t number) const override;
  PortHolder Holder(std::int32_t number) const override { return ports_.At(number).holder; }
  void WatchPorts(const std::function<void()>& handler) override { watch_ = handler; }

  void Open(std::int32_t number, std::int32_t baud) override;
  void Close() noexcept override;
  void SetReceiveThreshold(std::int32_t bytes) override;
  void SetRts(bool asserted) override;
  void Write(std::span<const std::uint8_t> bytes) override;
  Bytes ReadAll() override;
  void ClearInput() override;
  std::size_t PendingOutput() const override;

  // The adapter was pulled out.
  void Lose();
  const std::function<void()>& Watch() const { return watch_; }
  bool HasEvent() const { return DataIsDue() || overflowed_ || lost_; }
  // Delivers one event. The owner may do anything in it, also destroy this device.
  void DeliverEvent();

 private:
  // The line of the open port; null when the adapter was pulled out.
  VirtualLine* OpenLine() const;
  bool DataIsDue() const {
    return unreported_ && receive_threshold_ > 0 &&
           input_.size() >= static_cast<std::size_t>(receive_threshold_);
  }
  void Arrive(std::uint8_t byte);
  void ForgetInput();
  void LetGoOfLine();

  VirtualPorts& ports_;
  std::function<void(SerialEvent)> handler_;
  std::function<void()> watch_;
  std::int32_t receive_threshold_ = 0;
  Port* port_ = nullptr;     // while open and plugged in
  Bytes input_;              // at most kSerialInputBufferBytes
  bool unreported_ = false;  // kDataReceived is due as soon as enough bytes wait
  bool overflowed_ = false;  // kReceiveOverflow is due
  bool lost_ = false;        // kDeviceLost is due; port_ is null then
};

DeviceDescription VirtualPorts::Device::Describe(std::int32_t number) const {
  if (!Exists(number)) return {};
  return {.adapter = "Virtual serial line " + std::to_string(number)};
}

bool VirtualPorts::Device::Exists(std::int32_t number) const {
  const auto port = ports_.ports_.find(number);
  return port != ports_.ports_.end() && port->second->plugged_in;
}

void VirtualPorts::Device::Open(std::int32_t number, std::int32_t baud) {
  const std::string name = CommName(number);
  if (port_ != nullptr || lost_) throw Fault(kErrPortAlreadyOpen, "A port is open already.");
  if (!Exists(number)) throw Fault(kErrInvalidPort, name + " does not exist. Is its adapter plugged in?");
  if (baud <= 0) throw Fault(kErrSettingsRefused, name + " does not do " + std::to_string(baud) + " bit/s.");
  Port& port = ports_.At(number);
  if (!port.allowed) {
    throw Fault(kErrNotAllowed,
                "You are not allowed to use " + name +
                    ". Its device belongs to the group \"dialout\": ask for your user to be added "
                    "to that group, then log in again.");
  }
  if (port.held_by_another || port.opener != nullptr) {
    throw Fault(kErrPortAlreadyOpen, name + " is in use by another program.");
  }
  port_ = &port;
  port.opener = this;
  port.line.SetProgramBaud(static_cast<std::uint32_t>(baud), ports_.NowUs());
  port.line.SetProgramHandler([this](std::uint8_t byte, std::uint64_t /*at_us*/) { Arrive(byte); });
}

void VirtualPorts::Device::Close() noexcept {
  LetGoOfLine();
  lost_ = false;
  ForgetInput();
  ports_.Schedule();
}

void VirtualPorts::Device::LetGoOfLine() {
  if (port_ == nullptr) return;
  const std::uint64_t now_us = ports_.NowUs();
  port_->line.DropPendingFromProgram(now_us);
  port_->line.SetDriver(false, now_us);
  port_->line.SetProgramHandler({});
  port_->opener = nullptr;
  port_ = nullptr;
}

void VirtualPorts::Device::Lose() {
  LetGoOfLine();
  lost_ = true;
  ports_.Schedule();
}

VirtualLine* VirtualPorts::Device::OpenLine() const {
  if (port_ == nullptr && !lost_) throw Fault(kErrPortNotOpen, "No port is open.");
  return port_ != nullptr ? &port_->line : nullptr;
}

void VirtualPorts::Device::SetReceiveThreshold(std::int32_t bytes) {
  if (bytes < 0) throw Fault(kErrInvalidPropertyValue, "A receive threshold must be 0 or more.");
  receive_threshold_ = bytes;
  unreported_ = !input_.empty();  // what waits may be enough for the new threshold
  if (port_ != nullptr) ports_.Schedule();
}

void VirtualPorts::Device::SetRts(bool asserted) {
  if (VirtualLine* line = OpenLine()) line->SetDriver(asserted, ports_.NowUs());
}

void VirtualPorts::Device::Write(std::span<const std::uint8_t> bytes) {
  if (VirtualLine* line = OpenLine()) line->ProgramWrites(bytes, ports_.NowUs());
  ports_.Schedule();
}

Bytes VirtualPorts::Device::ReadAll() {
  if (VirtualLine* line = OpenLine()) line->AdvanceTo(ports_.NowUs());
  unreported_ = false;
  return std::exchange(input_, {});
}

void VirtualPorts::Device::ClearInput() {
  if (VirtualLine* line = OpenLine()) line->AdvanceTo(ports_.NowUs());
  ForgetInput();
}

std::size_t VirtualPorts::Device::PendingOutput() const {
  VirtualLine* line = OpenLine();
  return line != nullptr ? line->PendingFromProgram(ports_.NowUs()) : 0;
}

void VirtualPorts::Device::Arrive(std::uint8_t byte) {
  if (input_.size() >= kSerialInputBufferBytes) {
    overflowed_ = true;
    return;
  }
  input_.push_back(byte);
  unreported_ = true;
}

void VirtualPorts::Device::ForgetInput() {
  input_.clear();
  unreported_ = false;
  overflowed_ = false;
}

void VirtualPorts::Device::DeliverEvent() {
  SerialEvent event = SerialEvent::kDeviceLost;
  if (DataIsDue()) {
    unreported_ = false;
    event = SerialEvent::kDataReceived;
  } else if (std::exchange(overflowed_, false)) {
    event = SerialEvent::kReceiveOverflow;
  } else {
    Close();
  }
  const std::function<void(SerialEvent)> handler = handler_;
  if (handler) handler(event);
}

VirtualPorts::VirtualPorts(Clock& clock, TimerFactory& timers)
    : clock_(clock),
      last_ms_(clock.NowMs()),
      alarm_(std::make_unique<Alarm>(timers, [this] { Pump(); })),
      change_timer_(timers.CreateTimer([this] { ReportChange(); })) {
  change_timer_->SetInterval(kChangeReportMs);
}

VirtualPorts::~VirtualPorts() = default;

VirtualLine& VirtualPorts::AddPort(std::int32_t number, const VirtualLineOptions& options) {
  if (number < 1 || ports_.contains(number)) {
    throw std::invalid_argument("a port number is 1 or more and stands for one port");
  }
  NoticeChange();
  return ports_.emplace(number, std::make_unique<Port>(options)).first->second->line;
}

VirtualPorts::Port& VirtualPorts::At(std::int32_t number) { return *ports_.at(number); }

VirtualLine& VirtualPorts::Line(std::int32_t number) { return At(number).line; }

void VirtualPorts::Attach(std::int32_t number, std::unique_ptr<LineUnit> unit) {
  Port& port = At(number);
  port.line.AdvanceTo(NowUs());
  port.line.Attach(*unit);
  port.units.push_back(std::move(unit));
}

void VirtualPorts::Detach(std::int32_t number, LineUnit& unit) {
  Port& port = At(number);
  port.line.AdvanceTo(NowUs());
  port.line.Detach(unit);
  std::erase_if(port.units, [&](const auto& attached) { return attached.get() == &unit; });
}

void VirtualPorts::SetHeldByAnother(std::int32_t number, bool held, const PortHolder& holder) {
  At(number).held_by_another = held;
  At(number).holder = holder;
}

void VirtualPorts::SetAllowed(std::int32_t number, bool allowed) { At(number).allowed = allowed; }

void VirtualPorts::Unplug(std::int32_t number) {
  Port& port = At(number);
  port.plugged_in = false;
  if (port.opener != nullptr) port.opener->Lose();
  NoticeChange();
}

void VirtualPorts::Replug(std::int32_t number) {
  At(number).plugged_in = true;
  NoticeChange();
}

void VirtualPorts::NoticeChange() {
  const bool watched = std::any_of(devices_.begin(), devices_.end(),
                                   [](const Device* device) { return device->Watch() != nullptr; });
  if (watched && !change_timer_->Enabled()) change_timer_->SetEnabled(true);
}

void VirtualPorts::ReportChange() {
  change_timer_->SetEnabled(false);
  for (const Device* device : devices_) {
    if (device->Watch()) device->Watch()();
  }
}

std::unique_ptr<SerialDevice> VirtualPorts::CreateDevice() { return std::make_unique<Device>(*this); }

std::uint64_t VirtualPorts::NowUs() {
  const std::uint32_t now_ms = clock_.NowMs();
  elapsed_ms_ += now_ms - last_ms_;  // unsigned: right across the wrap
  last_ms_ = now_ms;
  return elapsed_ms_ * 1000;
}

void VirtualPorts::Pump() {
  const std::uint64_t now_us = NowUs();
  for (const auto& [number, port] : ports_) port->line.AdvanceTo(now_us);
  while (true) {
    // The next event is set up before the owner is called: a message box may keep it for long.
    Schedule();
    const auto device =
        std::find_if(devices_.begin(), devices_.end(), [](const Device* each) { return each->HasEvent(); });
    if (device == devices_.end()) return;
    (*device)->DeliverEvent();
  }
}

void VirtualPorts::Schedule() {
  const bool event_waits =
      std::any_of(devices_.begin(), devices_.end(), [](const Device* device) { return device->HasEvent(); });
  std::optional<std::uint64_t> next_us;
  for (const auto& [number, port] : ports_) {
    const auto at_us = port->line.NextEventUs();
    if (at_us && (!next_us || *at_us < *next_us)) next_us = at_us;
  }
  if (!event_waits && !next_us) {
    alarm_->Clear();
    return;
  }
  const std::uint64_t now_us = NowUs();
  std::uint64_t wait_ms = 1;  // the least that a timer can wait
  if (!event_waits && *next_us > now_us) wait_ms = (*next_us - now_us + 999) / 1000;
  alarm_->Set(
      static_cast<std::int32_t>(std::min<std::uint64_t>(wait_ms, std::numeric_limits<std::int32_t>::max())));
}

}  // namespace tendril
