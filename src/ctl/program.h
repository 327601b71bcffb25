// The program tendril-ctl, without its main function.
#pragma once

#include "ctl/command_line.h"
#include "ctl/environment.h"
#include "ctl/port_opening.h"
#include "ctl/report.h"
#include "ctl/unit_session.h"

namespace tendril::ctl {

// What a command works with.
struct Job {
  const CommandLine& line;
  Environment& environment;
  UnitSession& units;
  PortOpening& port;
};

// Prints what ends the program before a command, as a document where `json` asks for one. Returns the exit code.
int PrintEarlyEnd(const EarlyEnd& end, bool json, Terminal& terminal);

// The report when standard output takes no more, for the reason `fault`. When a stop has interrupted the writing, that is
// no problem.
Report ResultNotWritten(Environment& environment, const QString& fault);

// Runs the command and prints its report. Returns the exit code. The port that the command has opened is closed by then,
// and given back to the Control Panel if it was asked for it.
int RunCommand(const CommandLine& line, Environment& environment);

}  // namespace tendril::ctl
