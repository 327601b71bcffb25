// ComparisonLine: what the status bar says about a comparison, and the offer of one.
#pragma once

#include <QPushButton>
#include <QString>
#include <QWidget>

#include "ui/elided_label.h"

namespace tendril {

// Shows the result with the button that dismisses it, or the button of the offer, or nothing.
class ComparisonLine : public QWidget {
  Q_OBJECT

 public:
  ComparisonLine();

  // Shows `sentence`; `reading` says when the unit was read. An empty sentence hides it. Cheap while it is the same.
  void ShowResult(const QString& sentence, const QString& reading);
  // Shows the button that compares with `unit` ("01"), to which the configuration was sent; empty: hides it.
  void OfferAfterSend(const QString& unit);
  // Enables the offer. `running_command` is what runs; empty when nothing does.
  void EnableOffer(const QString& running_command);

 Q_SIGNALS:
  void ComparePressed();
  void DismissPressed();

 private:
  ElidedLabel* lblCompared_;
  QPushButton* cmdDismiss_;
  QPushButton* cmdOffer_;
};

}  // namespace tendril
