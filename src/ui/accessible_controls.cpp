#include "ui/accessible_controls.h"

#include <QAccessible>
#include <QAccessibleWidget>
#include <QCheckBox>
#include <QFrame>
#include <QRadioButton>
#include <QStackedWidget>

#include "simulator/servo_simulator.h"
#include "ui/accessible_combo_box.h"
#include "ui/accessible_text.h"
#include "ui/announcement.h"
#include "ui/controls.h"
#include "ui/output_button.h"

namespace tendril {
namespace {

// A button with an accessible name of its own.
class ButtonAccessible : public QAccessibleWidget {
 public:
  ButtonAccessible(QAbstractButton* button, QAccessible::Role role, const QString& action)
      : QAccessibleWidget(button, role), button_(*button), action_(action) {}

  QString text(QAccessible::Text kind) const override {
    QString text = QAccessibleWidget::text(kind);
    if (kind != QAccessible::Description) return text;
    if (state().selected) return DescribeSelected(button_.accessibleDescription());
    return text == QAccessibleWidget::text(QAccessible::Name) ? QString() : text;  // read once
  }
  // The name is complete: a label beside the button would be read in its place.
  QVector<QPair<QAccessibleInterface*, QAccessible::Relation>> relations(
      QAccessible::Relation) const override {
    return {};
  }

  QAccessible::State state() const override {
    QAccessible::State state = QAccessibleWidget::state();
    state.checkable = button_.isCheckable();
    state.checked = button_.isChecked();
    state.pressed = button_.isDown();
    if (const auto* output = qobject_cast<OutputButton*>(&button_)) {
      state.selectable = true;
      state.selected = output->Selected();
    }
    return state;
  }

  QStringList actionNames() const override {
    QStringList names = QAccessibleWidget::actionNames();
    if (button_.isEnabled()) names.prepend(action_);
    return names;
  }

  void doAction(const QString& action) override {
    if (action == action_ || action == pressAction()) {
      button_.click();
    } else {
      QAccessibleWidget::doAction(action);
    }
  }

 private:
  QAbstractButton& button_;
  const QString action_;
};

// A text that can be pressed.
class PressableTextAccessible : public TextAccessible {
 public:
  explicit PressableTextAccessible(PressableText* text)
      : TextAccessible(text, QAccessible::EditableText), text_(*text) {}

  QString Shown() const override { return text_.text(); }
  QAccessible::State state() const override {
    QAccessible::State state = TextAccessible::state();
    state.readOnly = true;
    return state;
  }

  QStringList actionNames() const override {
    QStringList names = TextAccessible::actionNames();
    if (text_.isEnabled()) names.prepend(pressAction());
    return names;
  }
  void doAction(const QString& action) override {
    if (action == pressAction()) {
      text_.Press();
    } else {
      TextAccessible::doAction(action);
    }
  }

  int cursorPosition() const override { return text_.cursorPosition(); }
  void setCursorPosition(int position) override { text_.setCursorPosition(position); }
  int offsetAtPoint(const QPoint& point) const override {
    return text_.cursorPositionAt(text_.mapFromGlobal(point));
  }

 private:
  PressableText& text_;
};

// A widget without a name unless it was given one. Qt's own takes the title of the group box around it.
class PlainAccessible : public QAccessibleWidget {
 public:
  using QAccessibleWidget::QAccessibleWidget;

  QString text(QAccessible::Text kind) const override {
    return kind == QAccessible::Name ? widget()->accessibleName() : QAccessibleWidget::text(kind);
  }
};

QAccessibleInterface* Create(const QString&, QObject* object) {
  const QString& toggle = QAccessibleActionInterface::toggleAction();
  const QString& press = QAccessibleActionInterface::pressAction();
  if (auto* box = qobject_cast<QCheckBox*>(object))
    return new ButtonAccessible(box, QAccessible::CheckBox, toggle);
  if (auto* option = qobject_cast<QRadioButton*>(object))
    return new ButtonAccessible(option, QAccessible::RadioButton, toggle);
  if (auto* output = qobject_cast<OutputButton*>(object))
    return new ButtonAccessible(output, QAccessible::Button, press);
  if (auto* text = qobject_cast<PressableText*>(object)) return new PressableTextAccessible(text);
  if (auto* label = qobject_cast<Announcement*>(object))
    return new PlainAccessible(label, QAccessible::Notification);
  if (auto* stack = qobject_cast<QStackedWidget*>(object))
    return new PlainAccessible(stack, QAccessible::Client);
  // Linux calls a window a frame, too.
  if (object->metaObject() == &QFrame::staticMetaObject || dynamic_cast<PopUp*>(object) != nullptr)
    return new PlainAccessible(static_cast<QFrame*>(object), QAccessible::Grouping);
  return CreateComboBoxInterface(object);
}

}  // namespace

void InstallAccessibleControls() {
  [[maybe_unused]] static const bool installed = (QAccessible::installFactory(&Create), true);
}

}  // namespace tendril
