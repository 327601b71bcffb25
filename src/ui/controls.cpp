#include "ui/controls.h"

#include <QAbstractButton>
#include <QGuiApplication>
#include <QKeyEvent>
#include <QPainter>
#include <QPalette>
#include <QSignalBlocker>
#include <QStyleOptionGroupBox>
#include <QWheelEvent>
#include <algorithm>
#include <utility>

#include "config/channel_config.h"

namespace tendril {

void CalmComboBox::wheelEvent(QWheelEvent* event) { event->ignore(); }

void CalmComboBox::Choose(int line) {
  if (!isEnabled()) return;
  hidePopup();
  setCurrentIndex(line);
  Q_EMIT activated(line);
}

PressableText::PressableText(std::function<void()> pressed) : pressed_(std::move(pressed)) {
  setReadOnly(true);
  // Selected, it would look as if it could be typed over.
  connect(this, &QLineEdit::selectionChanged, this, &QLineEdit::deselect);
}

void PressableText::Press() {
  if (isEnabled()) pressed_();
}

void PressableText::mousePressEvent(QMouseEvent* event) {
  if (event->button() == Qt::LeftButton) {
    Press();
  } else {
    QLineEdit::mousePressEvent(event);
  }
}

void PressableText::keyPressEvent(QKeyEvent* event) {
  const int key = event->key();
  if (key == Qt::Key_Return || key == Qt::Key_Enter || key == Qt::Key_Space) {
    Press();
  } else {
    QLineEdit::keyPressEvent(event);
  }
}

CalmSpinBox::CalmSpinBox(QWidget* parent) : QSpinBox(parent) {
  setKeyboardTracking(false);
  setFocusPolicy(Qt::StrongFocus);
  setSingleStep(10);
  setSuffix(QStringLiteral(" µs"));
  ApplyLimits();
  setFixedWidth(sizeHint().width());  // whatever its limits become, nothing around it moves
}

void CalmSpinBox::Show(const BoundedValue& value) {
  const QSignalBlocker silent(this);
  shown_ = value;
  if (!ArrowHeld()) ApplyLimits();
  setValue(value.Value());
}

// New limits would end the arrow's repetition. The release is not seen here when a box has opened meanwhile: only the
// mouse button itself says that it is over.
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

void FrameBox::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  // The picture's corners are made for one pixel to a unit.
  painter.setRenderHint(QPainter::SmoothPixmapTransform, devicePixelRatioF() != 1);
  QStyleOptionGroupBox option;
  initStyleOption(&option);
  style()->drawComplexControl(QStyle::CC_GroupBox, &option, &painter, this);
}

QString ArrayName(const QString& array, int index) { return QStringLiteral("%1_%2").arg(array).arg(index); }

void Describe(QWidget* widget, const QString& what_it_does) { widget->setToolTip(what_it_does); }

void Disable(QWidget* widget, const QString& why) {
  widget->setEnabled(false);
  Describe(widget, why);
}

QLabel* DimLabel(const QString& text) {
  auto* label = new QLabel(text);
  label->setForegroundRole(QPalette::PlaceholderText);
  return label;
}

QLabel* BoldLabel(const QString& text) {
  auto* label = new QLabel(text);
  QFont font = label->font();
  font.setBold(true);
  label->setFont(font);
  return label;
}

void EnableUnless(const QString& why_not, QWidget* widget, const QString& what_it_does) {
  widget->setEnabled(why_not.isEmpty());
  Describe(widget, why_not.isEmpty() ? what_it_does : why_not);
}

void CheckOnly(QButtonGroup& group, int id) {
  QAbstractButton* checked = group.button(id);
  group.setExclusive(false);  // an exclusive group does not let go of its last button
  for (QAbstractButton* button : group.buttons()) button->setChecked(button == checked);
  group.setExclusive(true);
  // The Tab key stops at one of them; arrow keys go on from there.
  const QAbstractButton* stop = checked != nullptr ? checked : group.buttons().constFirst();
  for (QAbstractButton* button : group.buttons()) {
    button->setFocusPolicy(button == stop ? Qt::StrongFocus : Qt::ClickFocus);
  }
}

QPoint WithinParent(const QWidget& panel, QPoint wanted) {
  const QSize room = panel.parentWidget()->size() - panel.size();
  return {std::max(0, std::min(wanted.x(), room.width())), std::max(0, std::min(wanted.y(), room.height()))};
}

QString OutputLabel(std::int16_t port_type) {
  switch (port_type) {
    case kPortDigital:
      return QStringLiteral("DIGITAL\nPORT");
    case kPortPwm:
      return QStringLiteral("PWM\nPORT");
    default:
      return {};
  }
}

bool IsDark(const QWidget& widget) {
  const QPalette& palette = widget.palette();
  return palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness();
}

}  // namespace tendril
