// Report: what a command has to say when it ends.
#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QString>

namespace tendril::ctl {

inline constexpr int kExitSuccess = 0;
inline constexpr int kExitNotAsWished = 1;  // some unit differs, fails or is silent
inline constexpr int kExitUsage = 2;        // wrong use, or a file that cannot be used
inline constexpr int kExitPort = 3;         // the port cannot be opened

struct Report {
  int exit_code = kExitSuccess;
  QByteArray text = {};      // for standard output, in UTF-8, with the last line's end
  QJsonObject members = {};  // the command's part of the JSON document
  QString problem = {};      // one sentence for standard error; empty for none
};

// The command cannot begin: `problem` says why.
inline Report Refused(const QString& problem) { return {.exit_code = kExitUsage, .problem = problem}; }

}  // namespace tendril::ctl
