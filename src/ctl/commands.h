// The commands of tendril-ctl.
#pragma once

#include "ctl/program.h"
#include "ctl/report.h"

namespace tendril::ctl {

// Each checks files and names first, then opens the port if it needs one, and returns how it ended. A port that cannot
// be opened gives PortOpening's report. None raises.
Report Ports(Job& job);
Report Find(Job& job);
Report Get(Job& job);
Report Send(Job& job);
Report Compare(Job& job);
Report Backup(Job& job);
Report Restore(Job& job);
Report SetId(Job& job);
Report Show(Job& job);
Report WritePreset(Job& job);
Report Monitor(Job& job);

}  // namespace tendril::ctl
