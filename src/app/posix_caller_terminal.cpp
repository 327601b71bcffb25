#include "app/caller_terminal.h"

namespace tendril {

void ShowInTerminal(Stream stream, const QString& text) { WriteAll(stream, text.toStdString()); }

}  // namespace tendril
