// LiveTestArea: the slider that moves a servo by hand, with its warning.
#pragma once

#include <QGroupBox>

namespace tendril {

class LiveTestArea : public QGroupBox {
 public:
  explicit LiveTestArea(QWidget* parent = nullptr);

 protected:
  void changeEvent(QEvent* event) override;

 private:
  void ColourWarning();

  QWidget* warning_;
};

}  // namespace tendril
