#include "ui/status_line.h"

#include "ui/controls.h"

namespace tendril {

StatusLine::StatusLine() : lblStatus_(Named(new QLabel, "lblStatus")) { addWidget(lblStatus_, 1); }

void StatusLine::Say(const QString& sentence) { lblStatus_->setText(sentence); }

}  // namespace tendril
