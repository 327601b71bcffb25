// The help of tendril-ctl: lines of at most 80 columns.
#pragma once

#include <QString>

#include "ctl/command_table.h"

namespace tendril::ctl {

// `tendril-ctl --help`.
QString ProgramHelp();

// `tendril-ctl COMMAND --help`.
QString CommandHelp(const CommandInfo& command);

}  // namespace tendril::ctl
