// What the world and the user do in a simulation.
#include <QAbstractButton>
#include <QAbstractSlider>
#include <QAction>
#include <QApplication>
#include <QComboBox>
#include <QSpinBox>
#include <QTest>
#include <algorithm>
#include <utility>

#include "bench/faulty_units.h"
#include "simulation/simulation.h"
#include "ui/controls.h"

namespace tendril::test {
namespace {

constexpr int kMaxBoxesAtOnce = 3;

struct Command {
  const char* button;  // its name, or the beginning of it
  const char* what;
  int max_polls;  // of one step
};
constexpr std::array kCommands{
    Command{"Command3_0", "SEND", 3},         Command{"Command3_3", "SEND", 3},
    Command{"Command3_1", "GET", 33},         Command{"Command3_4", "GET", 33},
    Command{"Command3_2", "UPDATE", 15},      Command{"cmdCompare", "COMPARE", 33},
    Command{"cmdFindUnits", "FIND", 3 * 253}, Command{"cmdFindAgain", "FIND", 3 * 253}};

const Command* FindCommand(const std::string& button) {
  const auto command = std::find_if(kCommands.begin(), kCommands.end(),
                                    [&](const Command& each) { return button.starts_with(each.button); });
  return command == kCommands.end() ? nullptr : &*command;
}

// Units whose replies may come too late or together with something else.
bool TalksOutOfTurn(const FaultKind& kind) {
  constexpr std::array<std::string_view, 4> kNames{"flooding", "too-slow", "late", "unfinished"};
  return std::count(kNames.begin(), kNames.end(), kind.name) > 0;
}

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
  auto disturbed = std::make_unique<DisturbedUnit>(std::move(unit), weather_, random_);
  units_.push_back({port, disturbed.get()});
  world_.bench.Attach(port, std::move(disturbed));
}

void Simulation::AttachAnyUnits(std::int32_t port) {
  constexpr std::array<std::uint8_t, 4> kIds = {0x01, 0x01, 0x0A, 0xFF};
  const int count = plain_ ? 1 : random_.Pick(std::array{0, 1, 1, 1, 2});
  for (int i = 0; i < count; ++i) {
    const std::uint8_t id = random_.Pick(kIds);
    const FaultKind& kind = random_.Pick(FaultKinds());
    const bool proper = random_.Chance(60) || (plain_ && TalksOutOfTurn(kind));
    AttachUnit(port, proper ? std::make_unique<VirtualUnit>(id) : kind.make(id));
  }
}

void Simulation::DetachUnits(std::int32_t port) {
  for (const Place& place : units_) {
    if (place.port == port) world_.bench.Detach(port, *place.unit);
  }
  std::erase_if(units_, [port](const Place& place) { return place.port == port; });
}

void Simulation::MakeNoise(std::int32_t port) {
  Bytes noise(static_cast<std::size_t>(random_.Between(1, 40)));
  for (std::uint8_t& byte : noise)
    byte = random_.Chance(20) ? random_.Pick(std::array<std::uint8_t, 4>{0, 0, 0xFE, 1}) : random_.Byte();
  for (const Place& place : units_) {
    if (place.port == port) place.unit->AddNoise(noise);
  }
}

void Simulation::ActAsWorld() {
  const std::int32_t open_port = OpenPort();
  const std::int32_t port = open_port != 0 && random_.Chance(60) ? open_port : random_.Pick(kPorts);
  switch (random_.Below(plain_ ? 5 : 9)) {
    case 0:
      if (plain_ && port == open_port)
        return;  // the next acknowledgement could be that of an earlier command
      Note("Comm " + std::to_string(port) + " is unplugged");
      return world_.bench.Unplug(port);
    case 1:
    case 2:
      for (const std::int32_t each : kPorts) {
        world_.bench.Replug(each);
        world_.bench.SetAllowed(each, true);
      }
      return;
    case 3:
      if (port == open_port) return;
      if (random_.Chance(30)) return world_.bench.SetAllowed(port, false);
      return world_.bench.SetHeldByAnother(
          port, random_.Chance(60) || panel_.panel.Holds(static_cast<std::uint8_t>(port)));
    case 4:
      return ActAsPanel();
    case 5:
      return MakeNoise(port);
    case 6:
      DetachUnits(port);
      return AttachAnyUnits(port);
    default: {
      const std::uint32_t once_in = random_.Pick(std::array{0u, 0u, 20'000u, 2000u, 300u, 40u});
      const auto each = [&] { return random_.Chance(60) ? once_in : 0u; };
      weather_ = {.lost = each(), .doubled = each(), .altered = each(), .late = each()};
    }
  }
}

void Simulation::ActAsPanel() {
  switch (random_.Below(5)) {
    case 0: {
      panel_behaved_ = false;
      const PanelBehaviourKind& kind = random_.Pick(PanelBehaviourKinds());
      return panel_.panel.SetBehaviour(
          kind.behaviour, random_.Chance(50) ? std::optional<std::size_t>(random_.Below(4)) : std::nullopt);
    }
    case 1:
      panel_behaved_ = false;
      return panel_.panel.SetListener(random_.Chance(70) ? PanelListener::kOff : PanelListener::kStuck);
    case 2:
      panel_.panel.SetBehaviour(PanelBehaviour::kProper);
      return panel_.panel.SetListener(PanelListener::kOpen);
    default: {
      const auto port = static_cast<std::uint8_t>(random_.Between(1, 4));
      if (OpenPort() == port || !panel_ports_.insert(port).second) return;
      return panel_.Take(port);
    }
  }
}

void Simulation::CalmDown() {
  Note("all is well from here on");
  weather_ = {};
  panel_.panel.SetBehaviour(PanelBehaviour::kProper);
  panel_.panel.SetListener(PanelListener::kOpen);
  for (const std::int32_t port : kPorts) {
    world_.bench.Replug(port);
    world_.bench.SetAllowed(port, true);
    world_.bench.SetHeldByAnother(port, panel_.panel.Holds(static_cast<std::uint8_t>(port)));
    DetachUnits(port);
  }
  AttachUnit(1, std::make_unique<VirtualUnit>(std::uint8_t{1}));
}

// --- The user ---

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
  if (boxes_open_ >= kMaxBoxesAtOnce || !broken_.empty()) return;
  ++boxes_open_;
  for (int i = random_.Between(0, 3); i > 0; --i) {
    if (!calm_ && random_.Chance(40)) ActAsWorld();
    LetTimePass(AnyDuration());
  }
  --boxes_open_;
  world_.boxes.answer_yes = calm_ || random_.Chance(70);
}

void Simulation::ActAsUser() {
  const std::size_t boxes_before = BoxesShown();
  const int act = random_.Between(1, 100);
  if (act <= 25) {
    RunCommand(Find<QAbstractButton>(random_.Pick(
        std::array{"Command3_0", "Command3_0", "Command3_1", "Command3_2", "cmdCompare_0", "cmdFindUnits"})));
  } else if (act <= 35) {
    ChoosePort(static_cast<int>(random_.Below(7)));
  } else if (act <= 40) {
    ChooseUnit(random_.Pick(std::array<std::uint8_t, 5>{0x01, 0x01, 0x0A, 0xFF, random_.Byte()}));
  } else if (act <= 50) {
    UseSlider();
  } else if (act <= 60 && SummaryShown()) {
    Use(Find(random_.Pick(std::array{"cmdShowConfig", "spnSumValue_0"})));
  } else if (act <= 64) {
    TypeAnything();
  } else if (act <= 68) {
    PressEscape();
  } else if (act <= 74) {
    UndoOrRedo();
  } else if (act <= 75) {
    CopyOrPaste();
  } else if (act <= 76) {
    window_->findChild<QAction*>(QStringLiteral("actLine"))->trigger();
  } else {
    UseAnyControl();
  }
  Require(BoxesShown() <= boxes_before + 2,
          "an act of the user brings up one box, or a question and its answer");
}

void Simulation::ChoosePort(int number) {
  auto& ports = Find<CalmComboBox>("cmbNYX");
  if (!Usable(ports)) return;
  Q_EMIT ports.Opening();
  const int line = number == 0 ? 0 : ports.findText(QString::fromStdString(CommName(number)));
  if (line < 0) return;
  Note("the user chooses " + ports.itemText(line).toStdString());
  ports.setCurrentIndex(line);
  Q_EMIT ports.activated(line);
}

void Simulation::ChooseUnit(std::uint8_t id) {
  if (!Usable(Find("CmbUnitID_0"))) return;
  Note("the user chooses unit " + std::to_string(id));
  Find<QComboBox>("CmbUnitID_0").setCurrentIndex(id / 16);
  Find<QComboBox>("CmbUnitID_1").setCurrentIndex(id % 16);
}

void Simulation::UseSlider() {
  if (random_.Chance(50) && !Find<QAbstractButton>("chkSendSlideCommands").isChecked()) {
    Use(Find("chkSendSlideCommands"));
    Use(Find(random_.Pick(std::array{"ServoSimulator2_0", "ServoSimulator2_5"})));
  }
  for (int i = random_.Between(1, 6); i > 0 && broken_.empty(); --i) {
    Use(Find("HScrollSendServoPosition"));
    LetTimePass(random_.Below(15));
  }
}

void Simulation::UseAnyControl() {
  QList<QWidget*> controls = window_->findChildren<QWidget*>();
  controls.removeIf([this](const QWidget* widget) {
    const bool takes_input = widget->inherits("QAbstractButton") || widget->inherits("QComboBox") ||
                             widget->inherits("QSpinBox") || widget->inherits("QAbstractSlider") ||
                             widget->objectName().startsWith(QStringLiteral("txtSum"));
    return !takes_input || widget->objectName().isEmpty() || !Usable(*widget);
  });
  Use(*controls[static_cast<qsizetype>(random_.Below(static_cast<std::size_t>(controls.size())))]);
}

void Simulation::Use(QWidget& control) {
  const std::string name = control.objectName().toStdString();
  if (!Usable(control) || name == "cmbNYX") return;
  if (name.starts_with("cmdCancel")) operation_.cancelled = true;
  const bool locked = CommandRuns();
  Note("the user uses " + name);
  if (auto* button = qobject_cast<QAbstractButton*>(&control)) {
    if (FindCommand(name) != nullptr) return RunCommand(*button);
    using_test_button_ = name.starts_with("cmdTest_") || name == "cmdStop";
    button->click();
    using_test_button_ = false;
  } else if (auto* list = qobject_cast<QComboBox*>(&control)) {
    const int entry = random_.Between(0, list->count() - 1);
    list->setCurrentIndex(entry);
    Q_EMIT list->activated(entry);
  } else if (auto* spin = qobject_cast<QSpinBox*>(&control)) {
    spin->setValue(spin->value() + random_.Between(-200, 200));
  } else if (auto* slider = qobject_cast<QAbstractSlider*>(&control)) {
    slider->setValue(random_.Between(slider->minimum(), slider->maximum()));
  } else {
    QTest::mouseClick(&control, Qt::LeftButton);
  }
  Require(!locked || window_->WorkingConfiguration() == records_,
          "nothing changes the records while a command runs");
  records_ = window_->WorkingConfiguration();
}

void Simulation::TypeAnything() {
  auto& spin = Find<QSpinBox>(
      SummaryShown() ? "spnSumValue_0"
                     : random_.Pick(std::array{"spnActPulseRange", "spnVirtPulseRange", "spnNeutralTrim",
                                               "spnLeftVirtStop", "spnDefaultPos"}));
  if (!Usable(spin)) return;
  const auto text = QString::fromLatin1(random_.Pick(
      std::array{"2400", "-1500", "99999999999999999999", "abc", "", "-", "+20", "1e3", "12a", "55"}));
  Note("the user types " + text.toStdString() + " into " + spin.objectName().toStdString());
  bool number = false;
  const int value = text.toInt(&number);
  const bool taken = number && value >= spin.minimum() && value <= spin.maximum();
  spin.setFocus();
  spin.selectAll();
  QTest::keyClick(&spin, Qt::Key_Delete);
  QTest::keyClicks(&spin, text);
  Require(window_->WorkingConfiguration() == records_, "what is typed is not stored before it is complete");
  const bool entered = random_.Chance(60);
  QTest::keyClick(&spin, entered ? Qt::Key_Return : Qt::Key_Escape);
  Require((entered && taken) || window_->WorkingConfiguration() == records_,
          "only a number within the limits is stored");
  records_ = window_->WorkingConfiguration();
}

void Simulation::PressEscape() {
  Note("the user presses Escape");
  const bool swept = SweepRuns();
  const bool slider = Find<QAbstractButton>("chkSendSlideCommands").isChecked();
  operation_.cancelled |= operation_.running;
  using_test_button_ = true;  // the end of a sweep moves the servo to the centre
  QTest::keyClick(window_.get(), Qt::Key_Escape);
  using_test_button_ = false;
  Require(!swept || !SweepRuns(), "Escape ends a sweep");
  Require(slider == Find<QAbstractButton>("chkSendSlideCommands").isChecked(),
          "Escape leaves the slider alone");
}

void Simulation::UndoOrRedo() {
  auto* undo = window_->findChild<QAction*>(QStringLiteral("actUndo"));
  auto* redo = window_->findChild<QAction*>(QStringLiteral("actRedo"));
  Require(!(SweepRuns() || CommandRuns()) || !(undo->isEnabled() || redo->isEnabled()),
          "undo is off while something moves or a command runs");
  for (const auto& [action, back] : {std::pair(undo, redo), {redo, undo}}) {
    if (!action->isEnabled() || random_.Chance(30)) continue;
    Note("the user chooses " + action->text().toStdString());
    undoing_ = true;
    action->trigger();
    const ChannelTable there = window_->WorkingConfiguration();
    back->trigger();
    Require(window_->WorkingConfiguration() == records_,
            "redo takes back what undo did, and undo what redo did");
    action->trigger();
    Require(window_->WorkingConfiguration() == there, "undo is the same each time");
    undoing_ = false;
    records_ = there;
  }
}

// A copy that was refused leaves the text of the one before.
void Simulation::CopyOrPaste() {
  auto* copy = window_->findChild<QAction*>(QStringLiteral("actCopyConfiguration"));
  auto* paste = window_->findChild<QAction*>(QStringLiteral("actPasteConfiguration"));
  undoing_ = true;
  if (random_.Chance(50)) {
    Note("the user copies the configuration");
    copy->trigger();
    if (AllRecordsValid()) copied_ = window_->WorkingConfiguration();
  } else if (paste->isEnabled() && copied_) {
    Note("the user pastes the configuration");
    paste->trigger();
    records_ = window_->WorkingConfiguration();
    for (std::size_t slot = 0; slot < kPortCount; ++slot) {
      ChannelConfig& expected = copied_->At(slot);
      expected.Received = records_.At(slot).Received;  // no part of the text
      Require(records_.At(slot) == expected, "what is pasted is what was copied");
    }
  }
  undoing_ = false;
}

void Simulation::RunCommand(QAbstractButton& button) {
  if (!button.isEnabledTo(window_.get())) return;
  if (CommandRuns()) return button.click();  // shows the list of the units that are being found
  const Command& command = *FindCommand(button.objectName().toStdString());
  operation_ = {.what = command.what,
                .max_polls = command.max_polls,
                .comm_port = link_.CommPort(),
                .swept = SweepRuns(),
                .unit = static_cast<std::uint8_t>(Find<QComboBox>("CmbUnitID_0").currentIndex() * 16 +
                                                  Find<QComboBox>("CmbUnitID_1").currentIndex()),
                .boxes_before = BoxesShown(),
                .last_activity_ms = world_.time.ElapsedMs()};
  Note("the user presses " + operation_.what);
  button.click();
  operation_.running = CommandRuns();
  operation_.swept = false;
  const std::size_t boxes = BoxesShown() - operation_.boxes_before;
  Require(boxes == (operation_.running ? 0u : 1u), "a command starts, or a box gives the reason");
}

void Simulation::Close() {
  const std::optional<std::uint8_t> requested = panel_.control_panel.RequestedPort();
  const std::size_t boxes_before = world_.boxes.shown.size();
  operation_.running = false;
  Note("the user closes the window");
  if (requested) window_->show();
  bool closed = window_->close();
  Require(closed == !requested, "the window closes at once unless a port has to be given back");
  world_.time.Advance(150);
  closed = closed || !window_->isVisible();
  Require(closed && !link_.PortOpen() && OpenPort() == 0, "a closed window leaves no port open");
  closed_ = true;
  world_.time.Advance(5000);
  Require(world_.boxes.shown.size() == boxes_before, "closing shows no box");
  if (calm_ && requested && panel_ports_.contains(*requested))
    Require(panel_.panel.Holds(*requested), "the port is given back before the window closes");
}

}  // namespace tendril::test
