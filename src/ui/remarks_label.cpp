#include "ui/remarks_label.h"

namespace tendril {
namespace {

constexpr qsizetype kShownRemarks = 2;
constexpr int kLines = 3;  // the last one counts the others
constexpr char kWhy[] =
    "A unit holds pulse widths of 10 to 2550 µs. Editor and summary show the actual range about 1500 µs, "
    "and all else inside it.\nLeaving a channel, and the summary, store what is shown.";

}  // namespace

void RemarksLabel::ShowRemarks(const std::vector<std::string>& sentences) {
  QStringList all;
  for (const std::string& sentence : sentences) all += QString::fromStdString(sentence);
  QStringList lines;
  for (const QString& sentence : all.first(std::min(all.size(), kShownRemarks)))
    lines += QStringLiteral("⚠ ") + sentence;
  if (all.size() > kShownRemarks) lines += QStringLiteral("and %1 more").arg(all.size() - kShownRemarks);
  const QString whole = all.join(QLatin1Char('\n'));
  if (lines == lines_ && accessibleName() == whole) return;
  lines_ = lines;
  setToolTip(all.isEmpty() ? QString() : whole + QStringLiteral("\n\n") + QString::fromUtf8(kWhy));
  ShowLines();
  Announce(whole);
}

QSize RemarksLabel::sizeHint() const { return {0, kLines * fontMetrics().lineSpacing()}; }

void RemarksLabel::resizeEvent(QResizeEvent* event) {
  Announcement::resizeEvent(event);
  ShowLines();
}

void RemarksLabel::ShowLines() {
  QStringList fitting;
  for (const QString& line : lines_) fitting += fontMetrics().elidedText(line, Qt::ElideRight, width());
  setText(fitting.join(QLatin1Char('\n')));
}

}  // namespace tendril
