// ProgressArea: the bar that shows a running unit command and how it ended.
#pragma once

#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QStackedLayout>
#include <QWidget>

#include "ui/controls.h"
#include "ui/sign.h"
#include "unitops/running_command.h"

namespace tendril {

// The frame `frmProgress`. Shares its place with the frame of the apply boxes, so that nothing around them moves when
// one replaces the other.
class ProgressArea : public QGroupBox, public CommandProgressView {
  Q_OBJECT

 public:
  ProgressArea();

  // Puts `other` and this area into `place`. `other` is shown first.
  void SharePlace(QStackedLayout& place, QWidget* other);
  void ShowProgress(bool shown) override;
  int FrameWidth() const override { return pctProgress_->width(); }
  void SetBarWidth(int width) override;
  void SetTitle(const std::string& title) override { setTitle(QString::fromStdString(title)); }
  void SetColour(ProgressColour colour) override;
  void SetText(const std::string& text) override { lblProgress_->setText(QString::fromStdString(text)); }
  // Enables the button that cancels the command unless there is a reason not to.
  void EnableCancel(const QString& why_not);

 Q_SIGNALS:
  void CancelPressed();

 protected:
  void changeEvent(QEvent* event) override;

 private:
  void ApplyColour();

  QStackedLayout* place_ = nullptr;
  QWidget* pctProgress_;    // the bar's trough
  QWidget* ShapeProgress_;  // the bar
  QWidget* field_;          // the outcome, with its sign
  Sign* sign_;
  QLabel* lblProgress_;
  QPushButton* cmdCancel_;
  ProgressColour colour_ = ProgressColour::kBlue;
};

}  // namespace tendril
