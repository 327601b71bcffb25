// Progress: how far a command is, on standard error.
#pragma once

#include <QByteArray>
#include <QString>
#include <cstdint>

#include "ctl/command_line.h"
#include "ctl/environment.h"

namespace tendril::ctl {

// On a terminal one line that is drawn anew, with the time left; otherwise lines that stay. Silent with --quiet.
class Progress {
 public:
  // The time counts from now on. The environment must outlive it. Beside the trace of the line, which is on standard
  // error, too, all lines stay.
  Progress(const CommandLine& line, Environment& environment);
  // Clears the line.
  ~Progress();
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  // On a terminal, shows `text` and the time that is left when `part` of the whole is done, 0 to 1.
  void Show(const QString& text, double part);
  // Without a terminal, prints the line `text`.
  void Note(const QString& text);

 private:
  enum class Mode { kSilent, kLines, kRedrawn };

  QString TimeLeft(double part);
  void Draw(const QString& text);

  Environment& environment_;
  Mode mode_;
  std::uint32_t last_ms_;  // reading of the clock, which wraps
  std::uint64_t elapsed_ms_ = 0;
  QString drawn_;  // the line that is shown
};

}  // namespace tendril::ctl
