// AboutDialog: the facts that support asks for.
#pragma once

#include <QDialog>
#include <QFormLayout>
#include <QString>

#include "ui/program_info.h"

namespace tendril {

// Every fact can be selected and copied; "Copy" copies all of them. Not modal: a command goes on meanwhile.
class AboutDialog : public QDialog {
  Q_OBJECT  // found by its type

      public :
      // `window` owns it.
      AboutDialog(const ProgramInfo& info, QWidget& window);

 private:
  void AddFact(const QString& what, const QString& value);
  void AddButtons();

  QFormLayout* facts_ = new QFormLayout;
  QString text_;  // what "Copy" copies
};

// Shows the dialog of `window`. The first call makes it.
void ShowAbout(QWidget& window, const ProgramInfo& info);

}  // namespace tendril
