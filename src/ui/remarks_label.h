// RemarksLabel: what the user has to know about the records, in words.
#pragma once

#include <QLabel>
#include <QString>
#include <QStringList>
#include <string>
#include <vector>

namespace tendril {

// Keeps the room of its lines while there is nothing to say, so that nothing around it moves.
class RemarksLabel : public QLabel {
 public:
  RemarksLabel() { setAlignment(Qt::AlignLeft | Qt::AlignTop); }

  // Shows the first two of `sentences`, a line each, and how many more there are. The tool tip and the accessible
  // description have all of them.
  void ShowRemarks(const std::vector<std::string>& sentences);

  QSize sizeHint() const override;
  QSize minimumSizeHint() const override { return sizeHint(); }

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  void ShowLines();

  QStringList lines_;
};

}  // namespace tendril
