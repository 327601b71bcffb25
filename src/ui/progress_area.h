// ProgressArea: the bar that shows a running unit command and how it ended.
#pragma once

#include <QGroupBox>
#include <QLabel>
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
  // The title stays until the next command.
  void SetTitle(const std::string& title) override;
  void ShowStep(const std::string& step) override { setTitle(QString::fromStdString(step)); }
  void SetColour(ProgressColour colour) override;
  void SetText(const std::string& text) override;

 Q_SIGNALS:
  // What runs, how it ended, or where it stopped: a sentence to be read out.
  void Said(const QString& sentence);

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
  QString what_;  // what runs, or where it stopped
  ProgressColour colour_ = ProgressColour::kBlue;
};

}  // namespace tendril
