// ListComboBox: a combo box whose lines are chosen in its open list only.
#pragma once

#include "ui/controls.h"

namespace tendril {

// For choices that take effect at once: no key changes the closed box. The arrow keys and letters open the list; there
// Enter chooses.
class ListComboBox : public CalmComboBox {
  Q_OBJECT

 public:
  // What Enter does while the list is closed.
  enum class Enter { kOpensList, kChoosesAgain };

  explicit ListComboBox(Enter enter) : enter_(enter) {}

  // Whether the list is open.
  bool ListOpen() const;

 Q_SIGNALS:
  // Also when the list has closed, or the window has become active.
  void FocusArrived();

 protected:
  void keyPressEvent(QKeyEvent* event) override;
  void focusInEvent(QFocusEvent* event) override;

 private:
  const Enter enter_;
};

}  // namespace tendril
