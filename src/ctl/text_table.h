// TextTable: plain columns of text for a terminal.
#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>
#include <cstddef>
#include <vector>

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

  // The table in UTF-8, in lines without spaces at their ends. `colours`: the tones are shown.
  QByteArray Text(bool colours) const;

 private:
  std::vector<std::vector<TableCell>> rows_;
  std::vector<qsizetype> widths_;
};

// `text` in one line, without control characters: a text from a file does nothing to the terminal.
QString Printable(QString text);

}  // namespace tendril::ctl
