#include "ui/accessible_combo_box.h"

#include <QAbstractItemView>
#include <QAccessible>
#include <QAccessibleWidget>
#include <QPair>
#include <QVector>
#include <algorithm>
#include <vector>

#include "ui/accessible_text.h"
#include "ui/controls.h"

namespace tendril {
namespace {

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
    state.selected =
        view_.isVisible() ? view_.selectionModel()->isSelected(Index()) : line_ == box_.currentIndex();
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

  QAccessibleInterface* parent() const override { return QAccessible::queryAccessibleInterface(&box_); }
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

// A combo box. Its name says which one it is; Qt's own interface has the current line as the name on Linux. There Qt
// passes no value on: screen readers take the current line from the text. They read out what is inserted there if it is
// selected.
class ComboBoxAccessible : public TextAccessible {
 public:
  explicit ComboBoxAccessible(CalmComboBox* box) : TextAccessible(box, QAccessible::ComboBox), box_(*box) {
    QObject::connect(box, &QComboBox::currentTextChanged, box, [box](const QString& line) {
      QAccessibleTextInsertEvent event(box, 0, line);
      QAccessible::updateAccessibility(&event);
    });
  }

  QString Shown() const override { return box_.currentText(); }
  int selectionCount() const override { return 1; }
  void selection(int, int* begin, int* end) const override {
    *begin = 0;
    *end = characterCount();
  }
  QAccessible::State state() const override {
    QAccessible::State state = TextAccessible::state();
    state.expandable = state.hasPopup = true;
    state.expanded = box_.view()->isVisible();
    state.collapsed = !state.expanded;
    return state;
  }
  // The name is complete: a label beside the box would be read in its place.
  QVector<QPair<QAccessibleInterface*, QAccessible::Relation>> relations(
      QAccessible::Relation) const override {
    return {};
  }

  int childCount() const override { return 1; }
  QAccessibleInterface* child(int index) const override {
    return index == 0 ? QAccessible::queryAccessibleInterface(box_.view()) : nullptr;
  }
  int indexOfChild(const QAccessibleInterface* child) const override {
    return child->object() == box_.view() ? 0 : -1;
  }
  QAccessibleInterface* childAt(int, int) const override { return nullptr; }

  QStringList actionNames() const override {
    QStringList names = TextAccessible::actionNames();
    if (box_.isEnabled()) names = QStringList{showMenuAction(), pressAction()} + names;
    return names;
  }
  void doAction(const QString& action) override {
    if (action != showMenuAction() && action != pressAction()) {
      TextAccessible::doAction(action);
    } else if (box_.view()->isVisible()) {
      box_.hidePopup();
    } else if (box_.isEnabled()) {
      box_.showPopup();
    }
  }

 private:
  CalmComboBox& box_;
};

}  // namespace

QAccessibleInterface* CreateComboBoxInterface(QObject* object) {
  if (auto* box = qobject_cast<CalmComboBox*>(object)) return new ComboBoxAccessible(box);
  auto* view = qobject_cast<QAbstractItemView*>(object);
  if (view == nullptr || view->parent() == nullptr) return nullptr;
  // The view's parent is a frame in the box. The box's own view() would create the list again while it is created.
  auto* box = qobject_cast<CalmComboBox*>(view->parent()->parent());
  return box != nullptr ? new ListAccessible(view, *box) : nullptr;
}

}  // namespace tendril
