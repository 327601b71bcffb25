#include "ui/calm_spin_box.h"

#include <QGuiApplication>
#include <QLineEdit>
#include <QSignalBlocker>
#include <algorithm>
#include <cstdint>
#include <limits>

#include "ui/appearance.h"

namespace tendril {
namespace {

constexpr QColor kMarkColour(0xC0, 0x10, 0x20);
constexpr std::uint64_t kPairMs = 2;
constexpr int kLongestQuote = 20;  // of what was typed, in the status bar

bool IsEnter(const QKeyEvent& key) { return key.key() == Qt::Key_Return || key.key() == Qt::Key_Enter; }

// On every system, as in the menu.
bool IsRedo(const QKeyEvent& key) {
  return key.matches(QKeySequence::Redo) ||
         (key.key() == Qt::Key_Y && key.modifiers() == Qt::KeyboardModifiers(Qt::ControlModifier));
}

bool IsUndoOrRedo(const QKeyEvent& key) { return key.matches(QKeySequence::Undo) || IsRedo(key); }

}  // namespace

CalmSpinBox::CalmSpinBox(QWidget* parent) : QSpinBox(parent) {
  setKeyboardTracking(false);
  setFocusPolicy(Qt::StrongFocus);
  setSingleStep(10);
  setSuffix(QStringLiteral(" µs"));
  ApplyLimits();
  setFixedWidth(sizeHint().width());  // new limits move nothing around it
  connect(lineEdit(), &QLineEdit::textChanged, this, &CalmSpinBox::ShowHint);
}

void CalmSpinBox::Show(const BoundedValue& value) {
  shown_ = value;
  const QString typed = Typing() ? text() : QString();
  const int position = lineEdit()->cursorPosition();
  const bool other_value = value.Value() != this->value();
  {
    const QSignalBlocker silent(this);
    if (!ArrowHeld()) ApplyLimits();
    setValue(value.Value());
  }
  if (!typed.isNull() && typed != text()) {
    lineEdit()->setText(typed);
    lineEdit()->setCursorPosition(position);
  } else if (other_value && hasFocus()) {
    selectAll();  // the selection was of the old text; what is typed next replaces the number
  }
  ShowHint();  // for the new limits
}

void CalmSpinBox::SetMeaning(NumberMeaning meaning, int origin) {
  meaning_ = meaning;
  origin_ = origin;
}

bool CalmSpinBox::Typing() const { return cleanText() != textFromValue(value()); }

void CalmSpinBox::EndTyping() {
  if (!Typing()) return;
  if (Takes(text())) {
    interpretText();
    return;
  }
  QString typed = cleanText();
  if (typed.size() > kLongestQuote) typed = typed.left(kLongestQuote) + QStringLiteral("…");
  if (!typed.isEmpty() && !Number(typed)) typed = QStringLiteral("“%1”").arg(typed);
  PutBack();
  Q_EMIT Dropped(typed, QString::fromStdString(
                            DroppedNumber(typed.toStdString(), accessibleName().toStdString(), shown_)));
}

void CalmSpinBox::PutBack() {
  setValue(value());
  ShowHint();
}

// The whole number that is typed, with or without its unit. One that is too large for any type is just as far outside the
// limits as the largest.
std::optional<long long> CalmSpinBox::Number(QString text) const {
  const QString unit = suffix().trimmed();  // none at first
  while ((text = text.trimmed()).endsWith(unit) && !unit.isEmpty()) text.chop(unit.size());
  bool whole = false;
  const long long number = locale().toLongLong(text, &whole);
  if (whole) return number;
  const bool negative = text.startsWith(QLatin1Char('-'));
  const QString digits = text.mid(negative ? 1 : 0);
  using Limits = std::numeric_limits<long long>;
  if (!digits.isEmpty() && std::all_of(digits.begin(), digits.end(), [](QChar c) { return c.isDigit(); }))
    return negative ? Limits::min() : Limits::max();
  return std::nullopt;
}

bool CalmSpinBox::Takes(const QString& text) const {
  const auto number = Number(text);
  return number && *number >= minimum() && *number <= maximum();
}

// Never invalid: an invalid text would not appear.
QValidator::State CalmSpinBox::validate(QString& text, int& /*position*/) const {
  return Takes(text) ? QValidator::Acceptable : QValidator::Intermediate;
}

int CalmSpinBox::valueFromText(const QString& text) const {
  return Takes(text) ? static_cast<int>(*Number(text)) : value();
}

// Nothing, and a sign that the limits allow, are the begin of a number.
QString CalmSpinBox::Hint() const {
  const QString typed = cleanText();
  const bool begun = typed.isEmpty() || (typed == QLatin1Char('-') && minimum() < 0) ||
                     (typed == QLatin1Char('+') && maximum() > 0);
  if (begun || !Typing() || Takes(typed)) return {};
  return QString::fromStdString(TypedNumberHint(Number(typed), shown_, meaning_, origin_));
}

void CalmSpinBox::ShowHint() {
  const QString hint = Hint();
  if (hint == hint_) return;
  hint_ = hint;
  Mark();
  Q_EMIT HintChanged(hint.isEmpty() ? hint : QStringLiteral("⚠ ") + hint,
                     hint.isEmpty() ? hint : accessibleName() + QStringLiteral(": ") + hint);
}

// Bold, and in a warning's colour.
void CalmSpinBox::Mark() {
  QFont type;
  QPalette colours;
  if (!hint_.isEmpty()) {
    type.setBold(true);
    colours.setColor(QPalette::Text,
                     WithContrast(kMarkColour, palette().color(QPalette::Base), kTextContrast));
  }
  lineEdit()->setFont(type);
  lineEdit()->setPalette(colours);
}

void CalmSpinBox::changeEvent(QEvent* event) {
  QSpinBox::changeEvent(event);
  if (event->type() == QEvent::PaletteChange && !hint_.isEmpty()) Mark();
}

// The window gets what has no use here: Ctrl+C without a selection copies the value, and undo takes an edit back unless
// there is typing to undo. Escape is the field's own as long as it has something to put back.
bool CalmSpinBox::event(QEvent* event) {
  if (event->type() != QEvent::ShortcutOverride) return QSpinBox::event(event);
  const auto& key = static_cast<const QKeyEvent&>(*event);
  const bool no_use =
      (key.matches(QKeySequence::Copy) && !lineEdit()->hasSelectedText()) || (IsUndoOrRedo(key) && !Typing());
  if (no_use) {
    event->ignore();
    return false;
  }
  if (Typing() && (IsUndoOrRedo(key) || key.key() == Qt::Key_Escape)) {
    event->accept();
    return true;
  }
  return QSpinBox::event(event);
}

void CalmSpinBox::keyPressEvent(QKeyEvent* event) {
  if (!event->isAutoRepeat() && !GoesOn(*event)) stepped_ = false;
  if (!event->isAutoRepeat()) key_held_ = true;
  if (Typing() && (event->key() == Qt::Key_Escape || event->matches(QKeySequence::Undo))) {
    PutBack();
    selectAll();
  } else if (IsUndoOrRedo(*event)) {
    if (!Typing()) event->ignore();
  } else {
    if (IsEnter(*event)) EndTyping();
    QSpinBox::keyPressEvent(event);
  }
}

// X reports a held key as pairs of a release and a press at the same time. Qt does not recognise each of them.
bool CalmSpinBox::GoesOn(const QKeyEvent& press) const {
  return press.key() == released_ && press.timestamp() != 0 && press.timestamp() - released_at_ <= kPairMs;
}

void CalmSpinBox::keyReleaseEvent(QKeyEvent* event) {
  if (!event->isAutoRepeat()) key_held_ = false;
  released_ = event->key();
  released_at_ = event->timestamp();
  QSpinBox::keyReleaseEvent(event);
}

// A step goes on from what is typed. From what cannot be taken it only goes back.
void CalmSpinBox::stepBy(int steps) {
  if (Typing()) {
    const bool taken = Takes(text());
    EndTyping();
    if (!taken) return;
  }
  const int before = value();
  const bool held = key_held_ || ArrowHeld();
  repeats_ = held && stepped_;
  QSpinBox::stepBy(steps);
  repeats_ = false;
  if (held && value() != before) stepped_ = true;
}

// The field's own menu opens without ending the typing, and a look into another window drops nothing.
void CalmSpinBox::focusOutEvent(QFocusEvent* event) {
  key_held_ = false;
  const bool comes_back = event->reason() == Qt::PopupFocusReason ||
                          (event->reason() == Qt::ActiveWindowFocusReason && !Takes(text()));
  if (comes_back && Typing()) {
    lineEdit()->event(event);
    update();
    return;
  }
  EndTyping();
  QSpinBox::focusOutEvent(event);
}

// A minimised window keeps what is typed. The base class would put the value back, also when the window is shown again.
void CalmSpinBox::showEvent(QShowEvent* event) {
  if (!event->spontaneous()) QSpinBox::showEvent(event);
}

void CalmSpinBox::hideEvent(QHideEvent* event) {
  if (event->spontaneous()) return;
  EndTyping();
  QSpinBox::hideEvent(event);
}

// New limits would stop a held arrow from repeating. The release does not arrive here when a message box has opened
// meanwhile, so the state of the mouse button decides.
bool CalmSpinBox::ArrowHeld() const {
  return pressed_ && QGuiApplication::mouseButtons().testFlag(Qt::LeftButton);
}

void CalmSpinBox::ApplyLimits() {
  if (minimum() != shown_.Minimum() || maximum() != shown_.Maximum()) {
    setRange(shown_.Minimum(), shown_.Maximum());
  }
}

void CalmSpinBox::mousePressEvent(QMouseEvent* event) {
  pressed_ = true;
  stepped_ = false;
  QSpinBox::mousePressEvent(event);
}

void CalmSpinBox::mouseReleaseEvent(QMouseEvent* event) {
  QSpinBox::mouseReleaseEvent(event);
  pressed_ = false;
  const QSignalBlocker silent(this);
  ApplyLimits();
}

void CalmSpinBox::wheelEvent(QWheelEvent* event) {
  if (hasFocus()) {
    QSpinBox::wheelEvent(event);
  } else {
    event->ignore();
  }
}

}  // namespace tendril
