#include "ui/editor_notes.h"

#include <QHBoxLayout>

#include "ui/controls.h"
#include "ui/sign.h"

namespace tendril {

EditorNotes::EditorNotes()
    : remarks_(Named(new RemarksLabel, "lblRemarks", 0)),
      unstored_(new QWidget(this)),
      lblUnstored_(Named(new NoticeLabel(2), "lblUnstored")),
      cmdStore_(Named(new QPushButton(QStringLiteral("Store")), "cmdStore")) {
  remarks_->setParent(this);
  Describe(cmdStore_,
           "Stores what is shown in the records of these channels, as a click on the channel's own apply box "
           "does.");
  cmdStore_->setFixedHeight(LowButtonHeight(*cmdStore_));
  connect(cmdStore_, &QAbstractButton::clicked, this, &EditorNotes::StorePressed);
  auto* row = AddLayout<QHBoxLayout>(unstored_, {}, 4);
  row->addWidget(new Sign(SignKind::kUnstored), 0, Qt::AlignTop);
  row->addWidget(lblUnstored_, 1);
  row->addWidget(cmdStore_, 0, Qt::AlignTop);
  unstored_->hide();
}

void EditorNotes::ShowUnstored(const std::string& sentence, const std::string& store) {
  const QString text = QString::fromStdString(sentence);
  if (!text.isEmpty()) cmdStore_->setText(QString::fromStdString(store));
  lblUnstored_->ShowNotice(text, text);
  if (unstored_->isHidden() == text.isEmpty()) return;
  unstored_->setVisible(!text.isEmpty());
  Place();
}

void EditorNotes::EnableStore(const QString& why_not) { EnableUnless(why_not, cmdStore_); }

QSize EditorNotes::sizeHint() const {
  return {0, remarks_->sizeHint().height() + lblUnstored_->sizeHint().height()};
}

QSize EditorNotes::minimumSizeHint() const { return {0, remarks_->sizeHint().height()}; }

void EditorNotes::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  Place();
}

void EditorNotes::Place() {
  const int height_of_unstored = lblUnstored_->sizeHint().height();
  const int top = height() - height_of_unstored;
  unstored_->setGeometry(0, top, width(), height_of_unstored);
  remarks_->setGeometry(0, 0, width(), unstored_->isHidden() ? height() : top);
}

}  // namespace tendril
