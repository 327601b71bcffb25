#include "ui/status_line.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QVBoxLayout>

#include "ui/controls.h"

namespace tendril {

// An announcement that fits into any width. Its text can be selected while all of it is shown.
class StatusLine::Sentence : public Announcement {
 protected:
  void paintEvent(QPaintEvent* event) override {
    if (sizeHint().width() <= width()) {
      Announcement::paintEvent(event);
    } else {
      PaintElided(*this);
    }
  }
};

namespace {

constexpr int kApart = 12;  // between two facts
// A window that is lower, and at least as wide, shows them beside what moves.
constexpr int kRoomForThreeLines = 760;
constexpr int kOneLineOfFacts = 1260;

}  // namespace

StatusLine::StatusLine()
    : lblPort_(Named(new ElidedLabel(QStringLiteral("Port")), "lblPort")),
      lblUnit_(Named(new ElidedLabel(QStringLiteral("Unit")), "lblUnit")),
      lblOrigin_(Named(new ElidedLabel(QStringLiteral("Configuration")), "lblOrigin")),
      lblStatus_(Named(new Sentence, "lblStatus")),
      cmdUndo_(Named(new QPushButton(QStringLiteral("Undo")), "cmdUndo")) {
  lblStatus_->setTextFormat(Qt::PlainText);
  lblStatus_->setTextInteractionFlags(Qt::TextSelectableByMouse);
  lblStatus_->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Fixed);
  Describe(cmdUndo_, "Takes back the last change. It sends nothing, and moves no servo. (Ctrl+Z)");
  cmdUndo_->setFixedHeight(LowButtonHeight(*cmdUndo_));
  cmdUndo_->hide();
  connect(cmdUndo_, &QAbstractButton::clicked, this, &StatusLine::UndoPressed);

  auto* lines = new QWidget;
  auto* column = AddLayout<QVBoxLayout>(lines, {6, 0, 0, 0}, 1);  // below the areas of the window
  facts_ = new QBoxLayout(QBoxLayout::TopToBottom);
  facts_->setSpacing(1);
  facts_->addWidget(moving_, 1);
  auto* three = new QHBoxLayout;
  three->setSpacing(kApart);
  for (ElidedLabel* fact : {lblPort_, lblUnit_, lblOrigin_}) three->addWidget(fact);
  three->addStretch(1);
  // Always shown in full. The other two share what is missing.
  lblUnit_->setMinimumWidth(fontMetrics().horizontalAdvance(QStringLiteral("Unit 00: no answer at 00:00")));
  facts_->addLayout(three, 2);
  column->addLayout(facts_);
  auto* sentence = new QHBoxLayout;
  sentence->addWidget(lblStatus_, 1);
  sentence->addWidget(compared_);
  sentence->addWidget(cmdUndo_);
  sentence->addItem(new QSpacerItem(0, cmdUndo_->height()));
  column->addLayout(sentence);
  addWidget(lines, 1);
}

void StatusLine::resizeEvent(QResizeEvent* event) {
  QStatusBar::resizeEvent(event);
  compared_->setMaximumWidth(width() * 2 / 5);  // the sentence matters more
  ArrangeFacts();
}

// The window's height has changed, too.
void StatusLine::moveEvent(QMoveEvent* event) {
  QStatusBar::moveEvent(event);
  ArrangeFacts();
}

void StatusLine::ShowBorrowed(const QString& text) {
  moving_->ShowBorrowed(text);
  borrowed_ = !text.isEmpty();
  ArrangeFacts();
}

// The notice needs a whole line.
void StatusLine::ArrangeFacts() {
  const bool low = window()->height() < kRoomForThreeLines;
  const bool one_line = low && width() >= kOneLineOfFacts && !borrowed_;
  const auto direction = one_line ? QBoxLayout::LeftToRight : QBoxLayout::TopToBottom;
  if (direction == facts_->direction()) return;
  facts_->setDirection(direction);
  facts_->setSpacing(direction == QBoxLayout::TopToBottom ? 1 : kApart);
}

void StatusLine::Say(const QString& sentence, const QString& spoken) {
  const QString both = earlier_.isEmpty() ? sentence : sentence + QStringLiteral(". ") + earlier_;
  earlier_.clear();
  lblStatus_->setText(both);
  lblStatus_->setToolTip(both);
  lblStatus_->Announce(spoken.isEmpty() ? both : both + QLatin1Char(' ') + spoken);
}

void StatusLine::SayTwice(const QString& sentence) {
  earlier_.clear();
  Say(sentence);
  earlier_ = said_twice_ = sentence;
}

void StatusLine::ForgetEarlier() {
  earlier_.clear();
  TakeAway(said_twice_);
}

void StatusLine::SayOfChange(const QString& sentence) {
  Say(sentence);
  of_change_ = sentence;
}

// It is no longer so.
void StatusLine::TakeAway(QString& said) {
  if (said.isEmpty()) return;
  QString rest = lblStatus_->text();
  rest.remove(QStringLiteral(". ") + said).remove(said);
  said.clear();
  if (rest == lblStatus_->text()) return;
  lblStatus_->setText(rest);
  lblStatus_->setToolTip(rest);
}

void StatusLine::OfferUndo(const QString& what) {
  cmdUndo_->setText(QStringLiteral("Undo ") + what);
  if (what.isEmpty()) MoveFocusToWindow(*cmdUndo_);
  cmdUndo_->setVisible(!what.isEmpty());
}

void StatusLine::EnableUndo(bool enabled) {
  if (!enabled) MoveFocusToWindow(*cmdUndo_);
  cmdUndo_->setEnabled(enabled);
}

void StatusLine::Copy() const {
  QString text = lblStatus_->text();
  for (const auto* fact : findChildren<ElidedLabel*>()) {
    if (!fact->text().isEmpty()) text += QLatin1Char('\n') + fact->text();
  }
  QGuiApplication::clipboard()->setText(text);
}

}  // namespace tendril
