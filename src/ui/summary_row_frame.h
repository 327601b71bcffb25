// SummaryRowFrame: what lies behind a row of the summary.
#pragma once

#include <QFrame>
#include <vector>

namespace tendril {

// The thin outline of a row, behind its controls. It signs the row in its corner, values at their upper edge, and options
// beside them.
class SummaryRowFrame : public QFrame {
 public:
  // Signs the row, or not, and of its values and options exactly these.
  void ShowDiffers(bool row, const std::vector<const QWidget*>& controls);

 protected:
  void paintEvent(QPaintEvent* event) override;

 private:
  bool row_differs_ = false;
  std::vector<const QWidget*> controls_;
};

}  // namespace tendril
