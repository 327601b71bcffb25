#include "ui/status_line.h"

#include <QClipboard>
#include <QGuiApplication>

#include "ui/controls.h"

namespace tendril {

StatusLine::StatusLine() : lblStatus_(Named(new Announcement, "lblStatus")) {
  lblStatus_->setTextFormat(Qt::PlainText);
  lblStatus_->setTextInteractionFlags(Qt::TextSelectableByMouse);
  lblStatus_->setContentsMargins(6, 0, 0, 0);  // below the areas of the window
  addWidget(lblStatus_, 1);
}

void StatusLine::Say(const QString& sentence) {
  lblStatus_->setText(sentence);
  lblStatus_->Announce(sentence);
}

void StatusLine::Copy() const { QGuiApplication::clipboard()->setText(lblStatus_->text()); }

}  // namespace tendril
