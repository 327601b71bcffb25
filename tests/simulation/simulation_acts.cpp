// What the world and the person do in a simulation.
#include <QAbstractButton>
#include <QAbstractSlider>
#include <QApplication>
#include <QComboBox>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QSpinBox>
#include <algorithm>
#include <utility>

#include "bench/faulty_units.h"
#include "simulation/simulation.h"

namespace tendril::test {
namespace {

constexpr std::array<std::uint8_t, 4> kPanelPorts = {1, 2, 3, 4};
constexpr int kMostBoxesAtOnce = 3;

}  // namespace

// --- The world ---

void Simulation::SetUpWorld() {
  world_.bench.AddPort(5, {.echo = false});
  world_.bench.AddPort(6, {.driver_follows_rts = false, .echo_loses_every = 37});
  for (const std::int32_t port : kPorts) AttachAnyUnits(port);
  if (random_.Chance(40)) ActAsPanel();
}

void Simulation::AttachUnit(std::int32_t port, std::unique_ptr<VirtualUnit> unit) {
  for (int number = 1; random_.Chance(50) && number <= kUnitPorts; ++number) {
    PortOptionBytes options = kFreshPortOptions;
    options[0] = static_cast<std::uint8_t>(random_.Between(1, 3) +
                                           random_.Pick(std::array{0x00, 0x14, 0x24, 0x48, 0x88}));
    const int centre = random_.Between(120, 180);
    for (std::size_t i = 1; i + 1 < options.size(); i += 2) {
      options[i] = static_cast<std::uint8_t>(random_.Between(50, centre));
      options[i + 1] = static_cast<std::uint8_t>(random_.Between(centre, 250));
    }
    if (random_.OneIn(40)) options[0] = 0x14;  // of no kind
    unit->SetPortOptions(number, options);
  }
  auto disturbed = std::make_unique<DisturbedUnit>(
      std::move(unit), disturbance_, [this](const DisturbedUnit& each, const Bytes& packet, bool damaged) {
        OnAccepted(each, packet, damaged);
      });
  units_.push_back({port, disturbed.get()});
  world_.bench.Attach(port, std::move(disturbed));
}

void Simulation::AttachAnyUnits(std::int32_t port) {
  constexpr std::array<std::uint8_t, 4> kIds = {0x01, 0x01, 0x0A, 0xFF};
  const int count = random_.Pick(std::array{0, 1, 1, 1, 2});
  for (int i = 0; i < count; ++i) {
    const std::uint8_t id = random_.Pick(kIds);
    if (random_.Chance(60)) {
      AttachUnit(port, std::make_unique<VirtualUnit>(id));
    } else {
      const FaultKind& kind = random_.Pick(FaultKinds());
      ++tally_.faults["units: " + std::string(kind.name)];
      AttachUnit(port, kind.make(id));
    }
  }
}

void Simulation::DetachUnits(std::int32_t port) {
  for (const Place& place : units_) {
    if (place.port == port) world_.bench.Detach(port, *place.unit);
  }
  if (port == device_.number()) operation_.replies_damaged = true;  // those of two units are mixed
  std::erase_if(units_, [port](const Place& place) { return place.port == port; });
}

void Simulation::ChangeWeather() {
  const std::uint32_t once_in = random_.Pick(std::array{0u, 0u, 20'000u, 2000u, 300u, 40u});
  const auto each = [&] { return random_.Chance(60) ? once_in : 0u; };
  disturbance_.weather = {.lost = each(), .doubled = each(), .altered = each(), .late = each()};
}

void Simulation::ActAsWorld() {
  const std::int32_t open_port = device_.IsOpen() ? device_.number() : 0;
  const std::int32_t port = open_port != 0 && random_.Chance(60) ? open_port : random_.Pick(kPorts);
  switch (random_.Below(9)) {
    case 0:
    case 1:
      return ChangeWeather();
    case 2: {
      ++tally_.faults["bursts of noise"];
      Bytes noise(static_cast<std::size_t>(random_.Between(1, 40)));
      for (std::uint8_t& byte : noise)
        byte = random_.Chance(20) ? random_.Pick(std::array<std::uint8_t, 4>{0, 0, 0xFE, 1}) : random_.Byte();
      if (port == open_port) device_.AddNoise(noise);
      for (const Place& place : units_) {
        if (place.port == port) place.unit->AddNoise(noise);
      }
      return;
    }
    case 3:
      ++tally_.faults["adapters unplugged"];
      Note("Comm " + std::to_string(port) + " is unplugged");
      return world_.bench.Unplug(port);
    case 4:
    case 5:
      for (const std::int32_t each : kPorts) {
        world_.bench.Replug(each);
        world_.bench.SetAllowed(each, true);
      }
      return;
    case 6: {
      if (port == open_port) return;
      if (random_.Chance(30)) {
        ++tally_.faults["ports not allowed"];
        return world_.bench.SetAllowed(port, false);
      }
      const bool held = random_.Chance(60) || panel_.panel.Holds(static_cast<std::uint8_t>(port));
      if (held) ++tally_.faults["ports held by another program"];
      return world_.bench.SetHeldByAnother(port, held);
    }
    case 7:
      ++tally_.faults["units exchanged"];
      DetachUnits(port);
      return AttachAnyUnits(port);
    default:
      return ActAsPanel();
  }
}

void Simulation::ActAsPanel() {
  switch (random_.Below(5)) {
    case 0: {
      panel_behaved_ = panel_proper_ = panel_always_there_ = false;
      const PanelBehaviourKind& kind = random_.Pick(PanelBehaviourKinds());
      ++tally_.faults["listener: " + std::string(kind.name)];
      Note("the panel behaves: " + std::string(kind.name));
      return panel_.panel.SetBehaviour(
          kind.behaviour, random_.Chance(50) ? std::optional<std::size_t>(random_.Below(4)) : std::nullopt);
    }
    case 1:
      panel_behaved_ = panel_behaved_ && (panel_.control_panel.Client().ReadyToTransmit() ||
                                          panel_.control_panel.Client().Closed());
      panel_proper_ = panel_always_there_ = false;
      ++tally_.faults["listener gone or stuck"];
      return panel_.panel.SetListener(random_.Chance(70) ? PanelListener::kOff : PanelListener::kStuck);
    case 2:
      panel_proper_ = true;
      panel_.panel.SetBehaviour(PanelBehaviour::kProper);
      return panel_.panel.SetListener(PanelListener::kOpen);
    default: {
      const std::uint8_t port = random_.Pick(kPanelPorts);
      if ((device_.IsOpen() && device_.number() == port) || !panel_ports_.insert(port).second) return;
      ++tally_.faults["ports taken by the Control Panel"];
      Note("the panel takes Comm " + std::to_string(port));
      return panel_.Take(port);
    }
  }
}

void Simulation::CalmDown() {
  Note("all is well from here on");
  disturbance_.weather = {};
  panel_.panel.SetBehaviour(PanelBehaviour::kProper);
  panel_.panel.SetListener(PanelListener::kOpen);
  panel_proper_ = true;
  for (const std::int32_t port : kPorts) {
    world_.bench.Replug(port);
    world_.bench.SetAllowed(port, true);
    world_.bench.SetHeldByAnother(port, false);
    DetachUnits(port);
  }
  AttachUnit(1, std::make_unique<VirtualUnit>(std::uint8_t{1}));
}

// --- The person ---

std::uint64_t Simulation::AnyDuration() {
  const int kind = random_.Between(1, 100);
  const int longest_ms = kind <= 30   ? 20
                         : kind <= 60 ? 400
                         : kind <= 85 ? 4000
                         : kind <= 98 ? 15'000
                                      : 600'000;
  return random_.Below(static_cast<std::size_t>(longest_ms));
}

void Simulation::WhileBoxOpen() {
  const BoxMessage& box = world_.boxes.shown.back();
  Note("box \"" + box.title + "\": " + box.text);
  if (boxes_open_ > 0) ++boxes_on_boxes_;
  if (BoxesShown() == operation_.boxes_before + 1) operation_.first_box = box.title;
  if (boxes_open_ >= kMostBoxesAtOnce || !broken_.empty()) return;
  ++boxes_open_;
  ++tally_.faults["boxes left open"];
  for (int i = random_.Between(0, 3); i > 0; --i) {
    if (!calm_ && random_.Chance(40)) ActAsWorld();
    LetTimePass(AnyDuration());
  }
  --boxes_open_;
  world_.boxes.answer_yes = calm_ || random_.Chance(70);
}

void Simulation::ActAsPerson() {
  const std::size_t boxes_before = BoxesShown();
  const int act = random_.Between(1, 100);
  if (act <= 25) {
    RunCommand(Find<QAbstractButton>(
        random_.Pick(std::array{"Command3_0", "Command3_0", "Command3_1", "Command3_2"})));
  } else if (act <= 35) {
    auto& ports = Find<QComboBox>("cmbNYX");
    ChoosePort(ports.itemText(static_cast<int>(random_.Below(static_cast<std::size_t>(ports.count()))))
                   .toStdString());
  } else if (act <= 40) {
    ChooseUnit(random_.Pick(std::array<std::uint8_t, 5>{0x01, 0x01, 0x0A, 0xFF, random_.Byte()}));
  } else if (act <= 50) {
    if (random_.Chance(50) && !Find<QAbstractButton>("chkSendSlideCommands").isChecked()) {
      Use(Find("chkSendSlideCommands"));
      Use(Find(random_.Pick(std::array{"ServoSimulator2_0", "ServoSimulator2_5"})));
    }
    for (int i = random_.Between(1, 6); i > 0 && broken_.empty(); --i) {
      Use(Find("HScrollSendServoPosition"));
      LetTimePass(random_.Below(15));
    }
  } else if (act <= 60 && SummaryShown()) {
    Use(Find(random_.Pick(std::array{"cmdShowConfig", "spnSumValue_0"})));
  } else {
    UseAnyControl();
  }
  Require(BoxesShown() <= boxes_before + 2,
          "an act of the person brings up one box, or a question and its answer");
}

void Simulation::ChoosePort(const std::string& line) {
  auto& ports = Find<QComboBox>("cmbNYX");
  if (!ports.isEnabledTo(window_.get())) return;
  Note("the person chooses " + line);
  const int entry = ports.findText(QString::fromStdString(line));
  ports.setCurrentIndex(entry);
  Q_EMIT ports.activated(entry);
  if (link_.PortOpen() && device_.number() == 5) ++tally_.faults["lines without an echo"];
  if (link_.PortOpen() && device_.number() == 6) ++tally_.faults["lines with a torn echo"];
}

void Simulation::ChooseUnit(std::uint8_t id) {
  if (!Find("CmbUnitID_0").isEnabledTo(window_.get())) return;
  Note("the person chooses unit " + std::to_string(id));
  Find<QComboBox>("CmbUnitID_0").setCurrentIndex(id / 16);
  Find<QComboBox>("CmbUnitID_1").setCurrentIndex(id % 16);
}

void Simulation::UseAnyControl() {
  const auto usable = [this](const QWidget* widget) {
    if (!widget->isEnabledTo(window_.get()) || !widget->isVisibleTo(window_.get())) return false;
    const QString name = widget->objectName();
    if (name.isEmpty() || name.startsWith(QStringLiteral("qt_"))) return false;
    return qobject_cast<const QAbstractButton*>(widget) != nullptr ||
           qobject_cast<const QComboBox*>(widget) != nullptr ||
           qobject_cast<const QSpinBox*>(widget) != nullptr ||
           qobject_cast<const QAbstractSlider*>(widget) != nullptr ||
           name.startsWith(QStringLiteral("ServoSimulator")) || name.startsWith(QStringLiteral("txtSum"));
  };
  QList<QWidget*> controls = window_->findChildren<QWidget*>();
  controls.removeIf([&](QWidget* widget) { return !usable(widget); });
  Use(*controls[static_cast<qsizetype>(random_.Below(static_cast<std::size_t>(controls.size())))]);
}

void Simulation::Use(QWidget& control) {
  const std::string name = control.objectName().toStdString();
  if (!control.isEnabledTo(window_.get()) || !control.isVisibleTo(window_.get()) || name == "cmbNYX") return;
  Note("the person uses " + name);
  if (auto* button = qobject_cast<QAbstractButton*>(&control)) {
    if (name.starts_with("Command3_")) return RunCommand(*button);
    using_test_button_ = name.starts_with("cmdTest_");
    button->click();
    using_test_button_ = false;
  } else if (auto* list = qobject_cast<QComboBox*>(&control)) {
    if (list->count() == 0) return;
    const auto entry = static_cast<int>(random_.Below(static_cast<std::size_t>(list->count())));
    list->setCurrentIndex(entry);
    Q_EMIT list->activated(entry);
  } else if (auto* spin = qobject_cast<QSpinBox*>(&control)) {
    if (random_.Chance(60)) {
      spin->stepBy(random_.Between(-20, 20));
    } else {
      spin->setValue(random_.Between(spin->minimum(), spin->maximum()));
    }
  } else if (auto* slider = qobject_cast<QAbstractSlider*>(&control)) {
    slider->setValue(random_.Between(slider->minimum(), slider->maximum()));
  } else if (random_.Chance(50)) {
    QKeyEvent press(QEvent::KeyPress, Qt::Key_Space, Qt::NoModifier);
    QKeyEvent release(QEvent::KeyRelease, Qt::Key_Space, Qt::NoModifier);
    QApplication::sendEvent(&control, &press);
    QApplication::sendEvent(&control, &release);
  } else {
    const QPointF middle = QRectF(control.rect()).center();
    for (const QEvent::Type type : {QEvent::MouseButtonPress, QEvent::MouseButtonRelease}) {
      QMouseEvent event(type, middle, control.mapToGlobal(middle), Qt::LeftButton,
                        type == QEvent::MouseButtonPress ? Qt::LeftButton : Qt::NoButton, Qt::NoModifier);
      QApplication::sendEvent(&control, &event);
    }
  }
  records_ = window_->WorkingConfiguration();
}

void Simulation::RunCommand(QAbstractButton& button) {
  if (!button.isEnabledTo(window_.get())) return;
  const QString text = button.text();
  operation_ = {.what = text.contains(QStringLiteral("send"), Qt::CaseInsensitive)  ? "SEND"
                        : text.contains(QStringLiteral("get"), Qt::CaseInsensitive) ? "GET"
                                                                                    : "UPDATE",
                .boxes_before = BoxesShown(),
                .last_activity_ms = world_.time.ElapsedMs(),
                .garbled_before = CountOnLines(&LineCounters::garbled_bytes),
                .swept = SweepRuns(),
                .unit = static_cast<std::uint8_t>(Find<QComboBox>("CmbUnitID_0").currentIndex() * 16 +
                                                  Find<QComboBox>("CmbUnitID_1").currentIndex())};
  Note("the person presses " + operation_.what);
  button.click();
  operation_.running = CommandRuns();
  operation_.swept = false;
  const std::size_t boxes = BoxesShown() - operation_.boxes_before;
  Require(boxes == (operation_.running ? 0u : 1u), "a command starts, or says why not");
  if (!operation_.running) ++tally_.seen[operation_.what + " not started: " + operation_.first_box];
}

void Simulation::Close() {
  const auto& client = panel_.control_panel.Client();
  const std::optional<std::uint8_t> requested = panel_.control_panel.RequestedPort();
  const bool can_give_back = client.ReadyToTransmit() && panel_proper_;
  const std::size_t boxes_before = world_.boxes.shown.size();
  if (std::exchange(operation_.running, false)) ++tally_.seen["windows closed while a command ran"];
  Note("the person closes the window");
  if (requested) window_->show();
  closing_ = true;
  bool closed = window_->close();
  Require(closed == !requested, "the window closes at once unless a port has to be given back");
  Require(!link_.PortOpen() || !closed, "a closed window has closed the port");
  if (!closed && random_.Chance(30)) {
    world_.time.Advance(random_.Below(90));
    if (window_->isEnabled()) ChoosePort("Comm " + std::to_string(random_.Between(1, 6)));
    Require(!link_.PortOpen(), "nothing opens the port while it is given back");
    if (random_.Chance(50)) closed = window_->close();
  }
  world_.time.Advance(150);
  closed = closed || !window_->isVisible();
  Require(closed && !link_.PortOpen() && !device_.IsOpen(), "a window that closes leaves no port open");
  closed_ = true;
  world_.time.Advance(5000);
  Require(world_.boxes.shown.size() == boxes_before, "closing shows no box");
  if (!requested || !panel_ports_.contains(*requested)) return;
  if (can_give_back) {
    Require(panel_.panel.Holds(*requested), "the port is given back before the window closes");
    ++tally_.seen["ports given back at closing"];
  }
}

}  // namespace tendril::test
