#include "ctl/folded_text.h"

namespace tendril::ctl {

QStringList Folded(const QString& text, qsizetype columns) {
  QStringList lines;
  for (const QString& word : text.split(u' ')) {
    if (lines.isEmpty() || lines.constLast().size() + 1 + word.size() > columns) {
      lines += word;
    } else {
      lines.last() += u' ' + word;
    }
  }
  return lines;
}

}  // namespace tendril::ctl
