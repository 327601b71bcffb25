#include "ctl/text_table.h"

#include <algorithm>
#include <utility>

namespace tendril::ctl {
namespace {

constexpr qsizetype kGap = 2;

QByteArray Coloured(const TableCell& cell) {
  QByteArray text = cell.text.toUtf8();
  switch (cell.tone) {
    case Tone::kGood:
      return "\x1b[32m" + text + "\x1b[m";
    case Tone::kBad:
      return "\x1b[31m" + text + "\x1b[m";
    case Tone::kPlain:
      break;
  }
  return text;
}

}  // namespace

TextTable::TextTable(const QStringList& headings) {
  std::vector<TableCell> cells;
  for (const QString& heading : headings) cells.push_back({heading});
  AddRow(std::move(cells));
}

void TextTable::AddRow(std::vector<TableCell> cells) {
  widths_.resize(std::max(widths_.size(), cells.size()));
  for (std::size_t i = 0; i < cells.size(); ++i) {
    cells[i].text = Printable(std::move(cells[i].text));
    widths_[i] = std::max(widths_[i], cells[i].text.size());
  }
  while (!cells.empty() && cells.back().text.isEmpty()) cells.pop_back();
  rows_.push_back(std::move(cells));
}

QByteArray TextTable::Text(bool colours) const {
  QByteArray text;
  for (const auto& cells : rows_) {
    for (std::size_t i = 0; i < cells.size(); ++i) {
      text += colours ? Coloured(cells[i]) : cells[i].text.toUtf8();
      if (i + 1 < cells.size()) text += QByteArray(widths_[i] - cells[i].text.size() + kGap, ' ');
    }
    text += '\n';
  }
  return text;
}

QString Printable(QString text) {
  for (QChar& each : text) {
    if (each.isSpace()) each = u' ';
    if (each.category() == QChar::Other_Control) each = QChar::ReplacementCharacter;
  }
  return text;
}

}  // namespace tendril::ctl
