// The terminal of a program with windows.
#pragma once

#include <QString>

#include "platform/standard_streams.h"

namespace tendril {

// Shows `text`, lines in fixed columns, in the terminal that the program was started in, or in the file or pipe that
// stands for it. On Windows, where a program with windows has no terminal of its own and may be started without one, a
// message box shows it then. A QApplication must exist.
void ShowInTerminal(Stream stream, const QString& text);

}  // namespace tendril
