// TextTable: plain columns of text for a terminal.
#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>
#include <cstddef>
#include <vector>

#include "ctl/environment.h"

namespace tendril::ctl {

// What a cell says of the outcome.
enum class Tone { kPlain, kGood, kBad };

struct TableCell {
  QString text = {};
  Tone tone = Tone::kPlain;
};

class TextTable {
 public:
  explicit TextTable(const QStringList& headings);

  // A row may have fewer cells than there are headings.
  void AddRow(std::vector<TableCell> cells);

  // The table in UTF-8, in lines without spaces at their ends, with the colours that `terminal` has. The last column is
  // folded at words to its width, unless that leaves it too narrow.
  QByteArray Text(const Terminal& terminal) const;

 private:
  // How wide the last column may be.
  qsizetype LastWidth(const Terminal& terminal) const;

  std::vector<std::vector<TableCell>> rows_;
  std::vector<qsizetype> widths_;
};

// `text` in one line, without control and format characters: a text from a file does nothing to the terminal.
QString Printable(const QString& text);

}  // namespace tendril::ctl
