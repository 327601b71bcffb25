// TraceModel: the entries of the trace as the rows of a table.
#pragma once

#include <QAbstractTableModel>
#include <QFont>
#include <QString>
#include <QVariant>
#include <array>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>

#include "trace/line_trace.h"

namespace tendril {

enum class TraceColumn { kTime, kFrom, kBytes, kMeaning };
inline constexpr std::array kTraceColumns{TraceColumn::kTime, TraceColumn::kFrom, TraceColumn::kBytes,
                                          TraceColumn::kMeaning};

// What a column shows of `entry`: the local time as "14:02:03.125", "unit", "FE 2A 01 00", what it means. A sign stands
// before the meaning of what should not happen.
QString TraceText(const TraceEntry& entry, TraceColumn column);
// The heading of a column.
QString TraceHeading(TraceColumn column);

// Follows the trace only when Update() is called. It never asks an entry for its texts before they are shown.
class TraceModel : public QAbstractTableModel {
 public:
  // `trace` must outlive its use.
  explicit TraceModel(LineTrace& trace);

  // Takes over what the trace has now. Returns how many rows dropped out at the front. Does nothing while it is frozen.
  int Update();
  // Frozen, it keeps the rows that it has, also those that the trace drops meanwhile.
  void SetFrozen(bool frozen);
  bool Frozen() const { return frozen_.has_value(); }
  // Clears the trace, and has no rows.
  void Clear();
  // Entries that came since the last update.
  std::uint64_t Waiting() const { return NextNumber() - next_; }
  // What the rows show. After an update.
  const std::deque<TraceEntry>& Entries() const { return frozen_ ? *frozen_ : trace_.Entries(); }

  int rowCount(const QModelIndex& parent = {}) const override;
  int columnCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QVariant headerData(int section, Qt::Orientation orientation, int role) const override;

 private:
  std::uint64_t NextNumber() const;
  int Remove(std::uint64_t first_kept);

  LineTrace& trace_;
  const QFont fixed_font_;
  std::optional<std::deque<TraceEntry>> frozen_;
  // The rows are the entries with these numbers, `next_` not among them. The trace may have dropped some since.
  std::uint64_t first_ = 0;
  std::uint64_t next_ = 0;
};

}  // namespace tendril
