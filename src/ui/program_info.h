// ProgramInfo: what the program says about itself.
#pragma once

#include <QString>

namespace tendril {

// The program's version.
struct Version {
  // "major.minor.revision".
  QString Text() const {
    return QStringLiteral("%1.%2.%3").arg(major_number).arg(minor_number).arg(revision);
  }

  int major_number;
  int minor_number;
  int revision;
};

// What support asks for first. The main program fills it in.
struct ProgramInfo {
  Version version;
  QString command_log;  // its path on this computer
  QString registry;     // the place of the registry that the program uses
};

}  // namespace tendril
