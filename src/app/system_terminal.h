// SystemTerminal: the standard streams of the process.
#pragma once

#include <QByteArray>
#include <QString>
#include <optional>

#include "ctl/environment.h"

namespace tendril {

class SystemTerminal final : public ctl::Terminal {
 public:
  // Both must outlive it.
  SystemTerminal(ctl::Waiting& waiting, ctl::StopRequest& stop) : waiting_(waiting), stop_(stop) {}

  QString Print(const QByteArray& text) override;
  void PrintError(const QByteArray& text) override;
  int ErrorColumns() const override;
  int OutputColumns() const override;
  bool Colours() const override;
  std::optional<QString> Ask(const QByteArray& question) override;
  bool CanAsk() const override;

 private:
  ctl::Waiting& waiting_;
  ctl::StopRequest& stop_;
  bool error_stalled_ = false;  // a signal has come while nothing read standard error
};

}  // namespace tendril
