#include "ctl/text_table.h"

#include <algorithm>
#include <limits>
#include <numeric>
#include <string>
#include <utility>

#include "ctl/folded_text.h"

namespace tendril::ctl {
namespace {

constexpr qsizetype kGap = 2;
constexpr qsizetype kNarrowest = 20;  // of a folded column

QByteArray Coloured(const QString& words, Tone tone) {
  QByteArray text = words.toUtf8();
  switch (tone) {
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
    cells[i].text = Printable(cells[i].text);
    widths_[i] = std::max(widths_[i], cells[i].text.size());
  }
  while (!cells.empty() && cells.back().text.isEmpty()) cells.pop_back();
  rows_.push_back(std::move(cells));
}

qsizetype TextTable::LastWidth(const Terminal& terminal) const {
  const qsizetype others = std::accumulate(widths_.begin(), widths_.end() - 1, qsizetype{0}) +
                           kGap * static_cast<qsizetype>(widths_.size() - 1);
  const qsizetype width = terminal.OutputColumns() - others;
  return width < kNarrowest ? std::numeric_limits<qsizetype>::max() : width;
}

QByteArray TextTable::Text(const Terminal& terminal) const {
  const bool colours = terminal.Colours();
  const qsizetype last_width = LastWidth(terminal);
  QByteArray text;
  for (const auto& cells : rows_) {
    qsizetype indent = 0;
    for (std::size_t i = 0; i < cells.size(); ++i) {
      const auto& [words, tone] = cells[i];
      const bool last = i + 1 == widths_.size();
      const QStringList lines = last ? Folded(words, last_width) : QStringList{words};
      for (qsizetype line = 0; line < lines.size(); ++line) {
        if (line > 0) text += '\n' + QByteArray(indent, ' ');
        text += colours ? Coloured(lines[line], tone) : lines[line].toUtf8();
      }
      if (i + 1 < cells.size()) text += QByteArray(widths_[i] - words.size() + kGap, ' ');
      indent += widths_[i] + kGap;
    }
    text += '\n';
  }
  return text;
}

QString Printable(const QString& text) {
  std::u32string points = text.toStdU32String();
  for (char32_t& each : points) {
    const QChar::Category category = QChar::category(each);
    if (QChar::isSpace(each)) {
      each = U' ';
    } else if (category == QChar::Other_Control || category == QChar::Other_Format) {
      each = QChar::ReplacementCharacter;
    }
  }
  return QString::fromStdU32String(points);
}

}  // namespace tendril::ctl
