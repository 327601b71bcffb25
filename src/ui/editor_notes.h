// EditorNotes: what the editor says about the records, in words.
#pragma once

#include <QPushButton>
#include <QWidget>
#include <string>
#include <vector>

#include "ui/notice_label.h"
#include "ui/remarks_label.h"

namespace tendril {

// Remarks on the records, with what differs from a unit; and what is shown and not stored, with the button that stores
// it. The place of both is kept while they are empty. Where it is too low for both, the second covers the last lines of the first.
class EditorNotes : public QWidget {
  Q_OBJECT

 public:
  EditorNotes();

  // Shows remarks on the records.
  void ShowRemarks(const std::vector<std::string>& sentences) { remarks_->ShowRemarks(sentences); }
  // Shows lines about what differs from a unit.
  void ShowDifferences(const QStringList& lines) { remarks_->ShowDifferences(lines); }
  // Shows what is not stored, and `store` on the button. An empty sentence shows neither.
  void ShowUnstored(const std::string& sentence, const std::string& store);
  // Enables the button unless there is a reason not to.
  void EnableStore(const QString& why_not);

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override;

 Q_SIGNALS:
  void StorePressed();

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void Place();

  RemarksLabel* remarks_;
  QWidget* unstored_;
  NoticeLabel* lblUnstored_;
  QPushButton* cmdStore_;
};

}  // namespace tendril
