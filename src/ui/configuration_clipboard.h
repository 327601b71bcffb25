// The configuration as text, on the clipboard.
#pragma once

#include <QString>

#include "ui/model/edited_configuration.h"

namespace tendril {

// Puts the records on the clipboard as text; with the unit and the time while they are what was read. Leaves the
// clipboard alone when a record cannot be sent. Returns what to say.
QString CopyAsText(const EditedConfiguration& configuration);

// Takes over the records of the text on the clipboard, and nothing else of it. Returns what to say when the text is
// refused, and nothing has changed; else an empty text.
QString PasteText(EditedConfiguration& configuration);

}  // namespace tendril
