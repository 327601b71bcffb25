// StatusLine: the window's status bar.
#pragma once

#include <QBoxLayout>
#include <QPushButton>
#include <QStatusBar>
#include <QString>

#include "ui/announcement.h"
#include "ui/comparison_line.h"
#include "ui/elided_label.h"
#include "ui/moving_line.h"

namespace tendril {

// What moves; the port, the unit and the origin of the configuration, in the same line where the width suffices; and one
// sentence, which stays until the next one. What has no room is elided. To show what is shown already costs nothing.
class StatusLine : public QStatusBar {
  Q_OBJECT

 public:
  StatusLine();

  // Shows `sentence`, and has it read out with `spoken`, which something else shows.
  void Say(const QString& sentence, const QString& spoken = {});
  // The same, and shows `sentence` beside the next one, too: what the user just did may say something itself.
  void SayTwice(const QString& sentence);
  // What SayTwice() said is no longer so: takes it away, and shows it beside no other sentence.
  void ForgetEarlier();
  // Shows `sentence` about the last change of a record, until the next change.
  void SayOfChange(const QString& sentence);
  void ForgetChange() { TakeAway(of_change_); }
  // Each shows one fact. An empty text shows nothing.
  void ShowPort(const QString& text) { lblPort_->Show(text); }
  void ShowUnit(const QString& text) { lblUnit_->Show(text); }
  void ShowOrigin(const QString& text) { lblOrigin_->Show(text); }
  // The notice of a borrowed port, beside what moves.
  void ShowBorrowed(const QString& text);
  // Shows the button that undoes `what`; empty: hides it.
  void OfferUndo(const QString& what);
  void EnableUndo(bool enabled);
  // The line that shows what moves.
  MovingLine& Moving() { return *moving_; }
  // What is shown of a comparison, beside the sentence.
  ComparisonLine& Compared() { return *compared_; }
  // Puts the sentence and the facts on the clipboard, each in a line of its own.
  void Copy() const;

 Q_SIGNALS:
  void UndoPressed();

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void moveEvent(QMoveEvent* event) override;

 private:
  class Sentence;

  void ArrangeFacts();
  void TakeAway(QString& said);

  MovingLine* moving_ = new MovingLine;
  QBoxLayout* facts_;  // what moves, and the three facts
  ElidedLabel* lblPort_;
  ElidedLabel* lblUnit_;
  ElidedLabel* lblOrigin_;
  Announcement* lblStatus_;
  bool borrowed_ = false;  // the notice is shown
  QString said_twice_;
  QString of_change_;
  QString earlier_;  // shown beside the next sentence
  ComparisonLine* compared_ = new ComparisonLine;
  QPushButton* cmdUndo_;
};

}  // namespace tendril
