#include "ui/number_entry.h"

#include <QGridLayout>
#include <QKeyEvent>

namespace tendril {
namespace {

constexpr std::int32_t kOpenMs = 3500;

}  // namespace

NumberEntry::NumberEntry(SummaryEditor& editor, TimerFactory& timers, QWidget& window)
    : PopUp("fraNumberEntry", window),
      editor_(editor),
      tmrAdjustDual_(timers.CreateTimer([this] { OnAdjustDual(); })),
      lblDisplay_(Named(BoldLabel(), "lblDisplay")) {
  tmrAdjustDual_->SetInterval(kOpenMs);
  auto* grid = new QGridLayout(this);
  grid->addWidget(lblDisplay_, 0, 0, 1, 2);
  for (std::size_t i = 0; i < spnSumValue_.size(); ++i) {
    auto* spin = spnSumValue_[i] = Named(new CalmSpinBox, "spnSumValue", i);
    spin->setAccessibleName(i == 0 ? QStringLiteral("New value") : QStringLiteral("New right stop"));
    Describe(spin, "The new value, in µs.");
    auto* reading = lblSumValue_[i] = Named(new QLabel, "lblSumValue", i);
    reading->setAlignment(Qt::AlignCenter);
    grid->addWidget(spin, 1, static_cast<int>(i));
    grid->addWidget(reading, 2, static_cast<int>(i));
    connect(spin, &QSpinBox::valueChanged, this, [this, i](int value) { OnSpin(i, value); });
  }
}

void NumberEntry::OnSpin(std::size_t index, int value) {
  if (!editor_.OpenEntry()) return;
  tmrAdjustDual_->SetEnabled(true);
  editor_.ChangeEntry(index, value);
  ShowEntry();
  Q_EMIT Changed(editor_.OpenEntry()->channel);
}

void NumberEntry::OpenNumberEntry(std::size_t channel, SummaryField field, QWidget& text) {
  tmrAdjustDual_->SetEnabled(false);
  text_ = &text;
  editor_.OpenNumberEntry(channel, field);
  ShowEntry();
  OpenBeside(text, 200, 300);
  // The Tab key moves on from here as it would from the text.
  setTabOrder(&text, spnSumValue_[0]);
  setTabOrder(spnSumValue_[0], spnSumValue_[1]);
  spnSumValue_[0]->setFocus();
  spnSumValue_[0]->selectAll();
}

void NumberEntry::ShowEntry() {
  lblDisplay_->setText(QString::fromStdString(editor_.Title()));
  const auto readings = editor_.Readings();
  const bool two = editor_.ShownSpins() > 1;
  for (std::size_t i = 0; i < spnSumValue_.size(); ++i) {
    CalmSpinBox& spin = *spnSumValue_[i];
    const QString side = !two ? QString() : i == 0 ? QStringLiteral(", left") : QStringLiteral(", right");
    spin.Show(editor_.Spin(i));
    spin.setVisible(i == 0 || two);
    spin.setAccessibleName(lblDisplay_->text() + side);
    Describe(
        &spin,
        QStringLiteral("From %1 to %2 µs. Escape closes the entry.").arg(spin.minimum()).arg(spin.maximum()));
    lblSumValue_[i]->setText(QString::fromStdString(readings[i]));
  }
}

void NumberEntry::OnAdjustDual() {
  tmrAdjustDual_->SetEnabled(false);
  for (CalmSpinBox* spin : spnSumValue_) spin->interpretText();  // typed text is a change, too
  if (!tmrAdjustDual_->Enabled()) Close();
}

void NumberEntry::Close() {
  tmrAdjustDual_->SetEnabled(false);
  editor_.CloseNumberEntry();
  if (!isVisible()) return;
  const bool had_focus = isAncestorOf(window()->focusWidget());
  hide();
  if (had_focus && text_) text_->setFocus();
}

void NumberEntry::keyPressEvent(QKeyEvent* event) {
  if (event->key() == Qt::Key_Escape) {
    Close();
  } else {
    QFrame::keyPressEvent(event);
  }
}

}  // namespace tendril
