#include "ui/accessible_controls.h"

#include <QAbstractItemView>
#include <QAccessible>
#include <QAccessibleWidget>
#include <QCheckBox>
#include <QRadioButton>
#include <algorithm>
#include <vector>

#include "ui/controls.h"

namespace tendril {
namespace {

// A check box or a radio button, which has an accessible name of its own.
class ToggleAccessible : public QAccessibleWidget {
 public:
  ToggleAccessible(QAbstractButton* button, QAccessible::Role role)
      : QAccessibleWidget(button, role), button_(*button) {}

  QAccessible::State state() const override {
    QAccessible::State state = QAccessibleWidget::state();
    state.checkable = true;
    state.checked = button_.isChecked();
    state.pressed = button_.isDown();
    return state;
  }

  QStringList actionNames() const override {
    QStringList names = QAccessibleWidget::actionNames();
    if (button_.isEnabled()) names.prepend(toggleAction());
    return names;
  }

  void doAction(const QString& action) override {
    if (action == toggleAction() || action == pressAction()) {
      button_.click();
    } else {
      QAccessibleWidget::doAction(action);
    }
  }

 private:
  QAbstractButton& button_;
};

// A line of a combo box's list.
class LineAccessible : public QAccessibleInterface, public QAccessibleActionInterface {
 public:
  LineAccessible(QAbstractItemView& view, CalmComboBox& box, int line)
      : view_(view), box_(box), line_(line) {}

  bool isValid() const override { return line_ < box_.count(); }
  QObject* object() const override { return nullptr; }
  QWindow* window() const override { return parent()->window(); }
  QAccessibleInterface* parent() const override { return QAccessible::queryAccessibleInterface(&view_); }
  QAccessibleInterface* child(int) const override { return nullptr; }
  QAccessibleInterface* childAt(int, int) const override { return nullptr; }
  int childCount() const override { return 0; }
  int indexOfChild(const QAccessibleInterface*) const override { return -1; }
  QAccessible::Role role() const override { return QAccessible::ListItem; }

  QString text(QAccessible::Text kind) const override {
    if (kind == QAccessible::Name) return box_.itemText(line_);
    if (kind == QAccessible::Description) return box_.itemData(line_, Qt::ToolTipRole).toString();
    return {};
  }
  void setText(QAccessible::Text, const QString&) override {}

  QRect rect() const override {
    const QRect rect = view_.visualRect(Index());
    return {view_.viewport()->mapToGlobal(rect.topLeft()), rect.size()};
  }

  QAccessible::State state() const override {
    QAccessible::State state;
    state.selectable = state.focusable = true;
    state.selected = view_.selectionModel()->isSelected(Index());
    state.focused = view_.hasFocus() && view_.currentIndex() == Index();
    state.invisible = !view_.isVisible();
    return state;
  }

  void* interface_cast(QAccessible::InterfaceType type) override {
    return type == QAccessible::ActionInterface ? static_cast<QAccessibleActionInterface*>(this) : nullptr;
  }
  QStringList actionNames() const override { return {pressAction(), toggleAction()}; }
  void doAction(const QString& action) override {
    if (actionNames().contains(action)) box_.Choose(line_);
  }
  QStringList keyBindingsForAction(const QString&) const override { return {}; }

 private:
  QModelIndex Index() const { return view_.model()->index(line_, box_.modelColumn(), view_.rootIndex()); }

  QAbstractItemView& view_;
  CalmComboBox& box_;
  const int line_;
};

// A combo box's list. The view and the box outlive it.
class ListAccessible : public QAccessibleWidget {
 public:
  ListAccessible(QAbstractItemView* view, CalmComboBox& box)
      : QAccessibleWidget(view, QAccessible::List), view_(*view), box_(box) {}
  ~ListAccessible() override {
    for (const QAccessible::Id line : lines_) QAccessible::deleteAccessibleInterface(line);
  }

  int childCount() const override { return box_.count(); }
  QAccessibleInterface* child(int index) const override {
    if (index < 0 || index >= childCount()) return nullptr;
    for (int next = static_cast<int>(lines_.size()); next <= index; ++next)
      lines_.push_back(QAccessible::registerAccessibleInterface(new LineAccessible(view_, box_, next)));
    return QAccessible::accessibleInterface(lines_[static_cast<std::size_t>(index)]);
  }
  int indexOfChild(const QAccessibleInterface* child) const override {
    const auto place = std::find_if(lines_.begin(), lines_.end(), [child](QAccessible::Id line) {
      return QAccessible::accessibleInterface(line) == child;
    });
    return place == lines_.end() ? -1 : static_cast<int>(place - lines_.begin());
  }
  QAccessibleInterface* childAt(int x, int y) const override {
    return child(view_.indexAt(view_.viewport()->mapFromGlobal(QPoint(x, y))).row());
  }
  QAccessibleInterface* focusChild() const override {
    return view_.hasFocus() ? child(view_.currentIndex().row()) : nullptr;
  }

 private:
  QAbstractItemView& view_;
  CalmComboBox& box_;
  mutable std::vector<QAccessible::Id> lines_;  // created on request
};

// A text that can be read character by character, and pressed.
class PressableTextAccessible : public QAccessibleWidget, public QAccessibleTextInterface {
 public:
  explicit PressableTextAccessible(PressableText* text)
      : QAccessibleWidget(text, QAccessible::EditableText), text_(*text) {}

  QString text(QAccessible::Text kind) const override {
    return kind == QAccessible::Value ? text_.text() : QAccessibleWidget::text(kind);
  }
  QAccessible::State state() const override {
    QAccessible::State state = QAccessibleWidget::state();
    state.readOnly = true;
    return state;
  }
  void* interface_cast(QAccessible::InterfaceType type) override {
    if (type == QAccessible::TextInterface) return static_cast<QAccessibleTextInterface*>(this);
    return QAccessibleWidget::interface_cast(type);
  }

  QStringList actionNames() const override {
    QStringList names = QAccessibleWidget::actionNames();
    if (text_.isEnabled()) names.prepend(pressAction());
    return names;
  }
  void doAction(const QString& action) override {
    if (action == pressAction()) {
      text_.Press();
    } else {
      QAccessibleWidget::doAction(action);
    }
  }

  QString text(int begin, int end) const override { return text_.text().mid(begin, end - begin); }
  int characterCount() const override { return static_cast<int>(text_.text().size()); }
  int cursorPosition() const override { return text_.cursorPosition(); }
  void setCursorPosition(int position) override { text_.setCursorPosition(position); }
  QRect characterRect(int) const override { return rect(); }
  int offsetAtPoint(const QPoint& point) const override {
    return text_.cursorPositionAt(text_.mapFromGlobal(point));
  }
  QString attributes(int, int* begin, int* end) const override {
    *begin = 0;
    *end = characterCount();
    return {};
  }
  // Nothing can be selected, and the whole text is visible.
  void selection(int, int* begin, int* end) const override { *begin = *end = 0; }
  int selectionCount() const override { return 0; }
  void addSelection(int, int) override {}
  void removeSelection(int) override {}
  void setSelection(int, int, int) override {}
  void scrollToSubstring(int, int) override {}

 private:
  PressableText& text_;
};

QAccessibleInterface* Create(const QString&, QObject* object) {
  if (auto* box = qobject_cast<QCheckBox*>(object)) return new ToggleAccessible(box, QAccessible::CheckBox);
  if (auto* option = qobject_cast<QRadioButton*>(object))
    return new ToggleAccessible(option, QAccessible::RadioButton);
  if (auto* text = qobject_cast<PressableText*>(object)) return new PressableTextAccessible(text);
  auto* view = qobject_cast<QAbstractItemView*>(object);
  if (view == nullptr || view->parent() == nullptr) return nullptr;
  // The view's parent is a frame in the box. The box's own view() would create the list again while it is created.
  auto* box = qobject_cast<CalmComboBox*>(view->parent()->parent());
  return box != nullptr ? new ListAccessible(view, *box) : nullptr;
}

}  // namespace

void InstallAccessibleControls() {
  [[maybe_unused]] static const bool installed = (QAccessible::installFactory(&Create), true);
}

}  // namespace tendril
