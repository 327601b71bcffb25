// WrappingRow: two widgets beside each other, or one below the other where the width does not suffice.
#pragma once

#include <QBoxLayout>
#include <QWidget>

namespace tendril {

class WrappingRow : public QWidget {
 public:
  WrappingRow(QWidget* first, QWidget* second);

  QSize minimumSizeHint() const override;

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  QBoxLayout* row_;
  QWidget* first_;
  QWidget* second_;
};

}  // namespace tendril
