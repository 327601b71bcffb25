#include "ui/announcement.h"

#include <QAccessible>

namespace tendril {

Announcement::Announcement() {
  QSizePolicy policy = sizePolicy();
  policy.setRetainSizeWhenHidden(true);
  setSizePolicy(policy);
  hide();
}

void Announcement::Announce(const QString& sentence) {
  setAccessibleName(sentence);
  const bool was_visible = isVisible();
  setVisible(!sentence.isEmpty());
  if (!was_visible || !isVisible()) return;  // a label that is shown only now appears by itself
  QAccessibleEvent appears(this, QAccessible::ObjectShow);
  QAccessible::updateAccessibility(&appears);
}

}  // namespace tendril
