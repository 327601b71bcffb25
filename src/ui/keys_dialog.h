// KeysDialog: the list of all keys.
#pragma once

#include <QDialog>
#include <QMenuBar>

namespace tendril {

// Stays open beside the window until it is closed.
class KeysDialog : public QDialog {
 public:
  // Lists the keys of `menus`, and what keys do in every control. `window` owns it.
  KeysDialog(const QMenuBar& menus, QWidget& window);
};

// Shows the dialog of `window`. The first call makes it.
void ShowKeys(QWidget& window, const QMenuBar& menus);

}  // namespace tendril
