// The search for units, for the commands that need it.
#pragma once

#include <QString>
#include <cstdint>

#include "ctl/program.h"
#include "ctl/unit_session.h"

namespace tendril::ctl {

// Polls the IDs from `first` to `last` and shows the progress; without a terminal, each unit as it is found. The
// session's Search() has what was found.
CommandResult FindWithProgress(Job& job, std::uint8_t first, std::uint8_t last);

// What was found, and why the search has ended early, if it has: sentences.
QString SearchSentence(const CommandResult& result, const UnitSearch& search);

}  // namespace tendril::ctl
