#include "ui/output_button.h"

#include <QAccessible>

namespace tendril {

void OutputButton::Select(bool selected) {
  if (selected == selected_) return;
  selected_ = selected;
  QAccessibleEvent event(this, selected ? QAccessible::SelectionAdd : QAccessible::SelectionRemove);
  QAccessible::updateAccessibility(&event);
}

}  // namespace tendril
