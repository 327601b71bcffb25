#include "ui/trace_model.h"

#include <QDateTime>
#include <QFontDatabase>
#include <algorithm>

#include "trace/trace_text.h"

namespace tendril {

QString TraceText(const TraceEntry& entry, TraceColumn column) {
  switch (column) {
    case TraceColumn::kTime:
      return QDateTime::fromMSecsSinceEpoch(entry.time_ms).toString(QStringLiteral("HH:mm:ss.zzz"));
    case TraceColumn::kFrom:
      return QString::fromStdString(entry.Direction());
    case TraceColumn::kBytes:
      return QString::fromStdString(TraceBytes(entry));
    case TraceColumn::kMeaning:
      return QString::fromStdString(TraceMeaning(entry));
  }
  return {};
}

QString TraceHeading(TraceColumn column) {
  switch (column) {
    case TraceColumn::kTime:
      return QStringLiteral("Time");
    case TraceColumn::kFrom:
      return QStringLiteral("From");
    case TraceColumn::kBytes:
      return QStringLiteral("Bytes");
    case TraceColumn::kMeaning:
      return QStringLiteral("Meaning");
  }
  return {};
}

TraceModel::TraceModel(LineTrace& trace)
    : trace_(trace), fixed_font_(QFontDatabase::systemFont(QFontDatabase::FixedFont)) {}

int TraceModel::Update() {
  if (Frozen()) return 0;
  const auto& entries = trace_.Entries();
  const int removed = Remove(entries.empty() ? NextNumber() : entries.front().number);
  if (const auto added = static_cast<int>(NextNumber() - next_); added > 0) {
    beginInsertRows({}, rowCount(), rowCount() + added - 1);
    next_ += static_cast<std::uint64_t>(added);
    endInsertRows();
  }
  return removed;
}

// After a row that is gone from the trace there may be a gap up to `first_kept`.
int TraceModel::Remove(std::uint64_t first_kept) {
  const auto removed = static_cast<int>(std::min(first_kept, next_) - first_);
  if (removed > 0) {
    beginRemoveRows({}, 0, removed - 1);
    first_ += static_cast<std::uint64_t>(removed);
    endRemoveRows();
  }
  if (first_ == next_) first_ = next_ = std::max(first_kept, next_);
  return removed;
}

void TraceModel::SetFrozen(bool frozen) {
  Update();
  if (frozen) {
    frozen_ = trace_.Entries();
  } else {
    frozen_.reset();
  }
}

void TraceModel::Clear() {
  Remove(NextNumber());
  if (frozen_) frozen_->clear();
  trace_.Clear();
}

std::uint64_t TraceModel::NextNumber() const {
  const auto& entries = trace_.Entries();
  return entries.empty() ? next_ : entries.back().number + 1;
}

int TraceModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(next_ - first_);
}

int TraceModel::columnCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(kTraceColumns.size());
}

QVariant TraceModel::data(const QModelIndex& index, int role) const {
  const TraceColumn column = kTraceColumns.at(static_cast<std::size_t>(index.column()));
  if (role == Qt::FontRole && column == TraceColumn::kBytes) return fixed_font_;
  const bool often_cut_off = column == TraceColumn::kBytes || column == TraceColumn::kMeaning;
  if (role != Qt::DisplayRole && (role != Qt::ToolTipRole || !often_cut_off)) return {};
  const auto& entries = Entries();
  const std::uint64_t number = first_ + static_cast<std::uint64_t>(index.row());
  if (entries.empty() || number < entries.front().number) return {};  // dropped since the update
  return TraceText(entries.at(number - entries.front().number), column);
}

QVariant TraceModel::headerData(int section, Qt::Orientation orientation, int role) const {
  if (orientation == Qt::Vertical || role != Qt::DisplayRole) return {};
  return TraceHeading(kTraceColumns.at(static_cast<std::size_t>(section)));
}

}  // namespace tendril
