#include "ui/comparison_line.h"

#include <QHBoxLayout>

#include "ui/controls.h"

namespace tendril {

ComparisonLine::ComparisonLine()
    : lblCompared_(Named(new ElidedLabel(QStringLiteral("Comparison")), "lblCompared")),
      cmdDismiss_(Named(new QPushButton(QStringLiteral("Dismiss")), "cmdDismiss")),
      cmdOffer_(Named(new QPushButton(QStringLiteral("Sent: compare?")), "cmdCompareSent")) {
  Describe(cmdDismiss_, "Ends the comparison with the unit.");
  Describe(cmdOffer_, "Reads the unit, and compares what it holds with the records. It changes no record.");
  auto* row = AddLayout<QHBoxLayout>(this, {}, 6);
  row->addWidget(lblCompared_);
  for (QPushButton* button : {cmdDismiss_, cmdOffer_}) {
    button->setFixedHeight(LowButtonHeight(*button));
    row->addWidget(button);
  }
  for (QWidget* part : {static_cast<QWidget*>(lblCompared_), static_cast<QWidget*>(cmdDismiss_),
                        static_cast<QWidget*>(cmdOffer_)})
    part->hide();
  connect(cmdDismiss_, &QAbstractButton::clicked, this, &ComparisonLine::DismissPressed);
  connect(cmdOffer_, &QAbstractButton::clicked, this, &ComparisonLine::ComparePressed);
}

void ComparisonLine::ShowResult(const QString& sentence, const QString& reading) {
  const bool shown = !sentence.isEmpty();
  lblCompared_->Show(sentence);
  if (shown)
    Describe(cmdDismiss_, QStringLiteral("Ends the comparison and takes its signs away. ") + reading);
  if (shown != lblCompared_->isHidden()) return;
  if (!shown) MoveFocusToWindow(*cmdDismiss_);
  lblCompared_->setVisible(shown);
  cmdDismiss_->setVisible(shown);
}

void ComparisonLine::OfferAfterSend(const QString& unit) {
  if (unit.isEmpty()) {
    MoveFocusToWindow(*cmdOffer_);
  } else {
    cmdOffer_->setText(QStringLiteral("Sent to %1: compare?").arg(unit));
  }
  cmdOffer_->setVisible(!unit.isEmpty());
}

void ComparisonLine::EnableOffer(const QString& running_command) { EnableUnless(running_command, cmdOffer_); }

}  // namespace tendril
