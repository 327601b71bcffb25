#include "prefs/saved_err.h"

namespace tendril {

SavedErr::SavedErr() : error_(CurrentFault()) {}

void SavedErr::Raise() const { throw RuntimeError(error_); }

}  // namespace tendril
