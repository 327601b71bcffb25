#include "ui/controls.h"

#include <QAbstractButton>
#include <QKeyEvent>
#include <QScrollArea>
#include <QTableView>
#include <algorithm>

#include "config/channel_config.h"

namespace tendril {

namespace {

constexpr char kDescription[] = "description";  // the property that keeps a control's description
constexpr char kDifference[] = "difference";    // and that how it differs from a unit
constexpr int kFormUnitsPerPixel = 15;

// The tool tip of an enabled control.
QString DescriptionOf(const QWidget& widget) {
  QString text = widget.property(kDescription).toString();
  const QString difference = widget.property(kDifference).toString();
  if (difference.isEmpty()) return text;
  if (!text.isEmpty()) text += QLatin1Char('\n');
  return text + QStringLiteral("≠ ") + difference;
}

// Sets one of the two. A reason why the control is disabled stays; see EnableUnless().
void SetDescription(QWidget& widget, const char* property, const QString& text) {
  const bool gives_reason = widget.toolTip() != DescriptionOf(widget);
  widget.setProperty(property, text);
  if (!gives_reason) widget.setToolTip(DescriptionOf(widget));
}

}  // namespace

void CalmComboBox::Choose(int line) {
  if (!isEnabled()) return;
  hidePopup();
  setCurrentIndex(line);
  Q_EMIT activated(line);
}

void CalmComboBox::showPopup() {
  Q_EMIT Opening();
  QComboBox::showPopup();
}

PressableText::PressableText() {
  setReadOnly(true);
  // A selection would make it look editable.
  connect(this, &QLineEdit::selectionChanged, this, &QLineEdit::deselect);
}

void PressableText::Press() {
  if (isEnabled()) Q_EMIT Pressed();
}

bool PressableText::event(QEvent* event) {
  const bool copy = event->type() == QEvent::ShortcutOverride &&
                    static_cast<QKeyEvent*>(event)->matches(QKeySequence::Copy);
  if (copy) event->ignore();
  return !copy && QLineEdit::event(event);
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

PopUp::PopUp(const char* name, QWidget& window) : QFrame(&window) {
  setObjectName(name);
  setFrameStyle(QFrame::Box | QFrame::Plain);
  setAutoFillBackground(true);
  hide();
}

void PopUp::OpenBeside(const QWidget& widget, int right, int below) {
  adjustSize();
  const QPoint wanted =
      widget.mapTo(parentWidget(), QPoint(right / kFormUnitsPerPixel, below / kFormUnitsPerPixel));
  const QSize room = parentWidget()->size() - size();
  move(std::max(0, std::min(wanted.x(), room.width())), std::max(0, std::min(wanted.y(), room.height())));
  raise();
  show();
}

void Describe(QWidget* widget, QAnyStringView what_it_does) {
  SetDescription(*widget, kDescription, what_it_does.toString());
}

void DescribeDifference(QWidget* widget, const QString& words) {
  if (widget->property(kDifference).toString() != words) SetDescription(*widget, kDifference, words);
}

void EnableUnless(const QString& why_not, QWidget* widget) {
  widget->setEnabled(why_not.isEmpty());
  widget->setToolTip(why_not.isEmpty() ? DescriptionOf(*widget) : why_not);
}

void CheckOnly(QButtonGroup& group, int id) {
  QAbstractButton* checked = group.button(id);
  group.setExclusive(false);  // an exclusive group does not let go of its last button
  for (QAbstractButton* button : group.buttons()) button->setChecked(button == checked);
  group.setExclusive(true);
  // The Tab key stops at one of them; the arrow keys move on from there.
  const QAbstractButton* stop = checked != nullptr ? checked : group.buttons().constFirst();
  for (QAbstractButton* button : group.buttons()) {
    button->setFocusPolicy(button == stop ? Qt::StrongFocus : Qt::ClickFocus);
  }
}

QLabel* DimLabel(QAnyStringView text) {
  auto* label = new QLabel(text.toString());
  label->setForegroundRole(QPalette::PlaceholderText);
  return label;
}

QLabel* BoldLabel(QAnyStringView text) {
  auto* label = new QLabel(text.toString());
  QFont font = label->font();
  font.setBold(true);
  label->setFont(font);
  return label;
}

int LowButtonHeight(const QWidget& button) { return button.fontMetrics().height() + 4; }

void MoveFocusToWindow(QWidget& widget) {
  if (widget.hasFocus()) widget.window()->setFocus();
}

QString SelectedRows(const QTableView& table) {
  QModelIndexList rows = table.selectionModel()->selectedRows();
  std::sort(rows.begin(), rows.end());
  QString text;
  for (const QModelIndex& row : rows) {
    QStringList cells;
    for (int column = 0; column < table.model()->columnCount(); ++column)
      cells += row.siblingAtColumn(column).data().toString();
    text += cells.join(QLatin1Char('\t')) + QLatin1Char('\n');
  }
  return text;
}

void Reveal(QWidget& widget) {
  for (QWidget* outer = widget.parentWidget(); outer != nullptr; outer = outer->parentWidget()) {
    if (auto* area = qobject_cast<QScrollArea*>(outer)) area->ensureWidgetVisible(&widget);
  }
}

void ScaleType(QWidget* widget, double factor) {
  QFont font = widget->font();
  font.setPointSizeF(font.pointSizeF() * factor);
  widget->setFont(font);
}

void SetPaletteColour(QWidget* widget, QPalette::ColorRole role, const QColor& colour) {
  QPalette palette = widget->palette();
  palette.setColor(role, colour);
  widget->setPalette(palette);
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

}  // namespace tendril
