// The commands that have no file of their own yet.
#include "ctl/commands.h"

namespace tendril::ctl {
namespace {

Report NotYet() {
  return {.exit_code = kExitUsage, .problem = QStringLiteral("This command is not there yet.")};
}

}  // namespace

Report Ports(Job& /*job*/) { return NotYet(); }
Report Find(Job& /*job*/) { return NotYet(); }
Report SetId(Job& /*job*/) { return NotYet(); }
Report Monitor(Job& /*job*/) { return NotYet(); }

}  // namespace tendril::ctl
