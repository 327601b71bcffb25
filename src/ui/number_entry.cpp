#include "ui/number_entry.h"

#include <QGridLayout>
#include <QKeyEvent>
#include <utility>

namespace tendril {
namespace {

constexpr std::int32_t kOpenMs = 3500;
// 200 and 300 form units to the right and below the text's corner.
constexpr QPoint kBesideText(200 / kFormUnitsPerPixel, 300 / kFormUnitsPerPixel);

}  // namespace

NumberEntry::NumberEntry(SummaryEditor& editor, TimerFactory& timers,
                         const std::function<void(std::size_t channel)>& changed, QWidget& window)
    : QFrame(&window),
      editor_(editor),
      tmrAdjustDual_(timers.CreateTimer([this] { OnAdjustDual(); })),
      lblDisplay_(Named(BoldLabel({}), QStringLiteral("lblDisplay"))) {
  setObjectName(QStringLiteral("fraNumberEntry"));
  setFrameStyle(QFrame::Box | QFrame::Plain);
  setAutoFillBackground(true);
  hide();
  tmrAdjustDual_->SetInterval(kOpenMs);
  auto* grid = new QGridLayout(this);
  grid->addWidget(lblDisplay_, 0, 0, 1, 2);
  for (int index = 0; index < 2; ++index) {
    const auto i = static_cast<std::size_t>(index);
    spnSumValue_[i] = Named(new CalmSpinBox, ArrayName(QStringLiteral("spnSumValue"), index));
    spnSumValue_[i]->setAccessibleName(index == 0 ? QStringLiteral("New value")
                                                  : QStringLiteral("New right stop"));
    Describe(spnSumValue_[i], QStringLiteral("The new value, in µs."));
    lblSumValue_[i] = Named(new QLabel, ArrayName(QStringLiteral("lblSumValue"), index));
    lblSumValue_[i]->setAlignment(Qt::AlignCenter);
    grid->addWidget(spnSumValue_[i], 1, index);
    grid->addWidget(lblSumValue_[i], 2, index);
    QObject::connect(spnSumValue_[i], &QSpinBox::valueChanged, this, [this, i, changed](int value) {
      if (!editor_.OpenEntry()) return;
      tmrAdjustDual_->SetEnabled(true);
      editor_.ChangeEntry(i, value);
      ShowEntry();
      changed(editor_.OpenEntry()->channel);
    });
  }
}

void NumberEntry::OpenNumberEntry(std::size_t channel, SummaryField field, QWidget& text) {
  tmrAdjustDual_->SetEnabled(false);
  text_ = &text;
  editor_.OpenNumberEntry(channel, field);
  ShowEntry();
  adjustSize();
  move(WithinParent(*this, text.mapTo(parentWidget(), QPoint()) + kBesideText));
  raise();
  show();
  // The Tab key goes on from here as it would from the text.
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
    spin.Show(editor_.Spin(i));
    spin.setVisible(i == 0 || two);
    spin.setAccessibleName(!two     ? lblDisplay_->text()
                           : i == 0 ? lblDisplay_->text() + QStringLiteral(", left")
                                    : lblDisplay_->text() + QStringLiteral(", right"));
    Describe(
        &spin,
        QStringLiteral("From %1 to %2 µs. Escape closes the entry.").arg(spin.minimum()).arg(spin.maximum()));
    lblSumValue_[i]->setText(QString::fromStdString(readings[i]));
  }
}

void NumberEntry::OnAdjustDual() {
  tmrAdjustDual_->SetEnabled(false);
  for (CalmSpinBox* spin : spnSumValue_) spin->interpretText();  // what is being typed is a change, too
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
