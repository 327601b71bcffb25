#include "ctl/command_table.h"

#include <algorithm>
#include <array>

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

constexpr unsigned kLineOptions =
    kPortOption | kTakePortOption | kDemoOption | kTraceOption | kQuietOption | kJsonOption;

constexpr auto kOptions = std::to_array<OptionInfo>({
    {kPortOption, "port"_L1, "N"_L1, "The comm port, 1 to 255. Default: the only one there is."_L1},
    {kTakePortOption,
     "take-port"_L1,
     {},
     "Ask the Control Panel for the port if it holds it, and give it back at the end."_L1},
    {kDemoOption,
     "demo"_L1,
     {},
     "Use virtual units inside the program instead of hardware: Comm 1 to 4, by default 1."_L1},
    {kNoCompareOption, "no-compare"_L1, {}, "Do not read back what was written."_L1},
    {kBackupFolderOption, "backup"_L1, "FOLDER"_L1,
     "Read each unit first, and keep what it held in FOLDER, as unit-0A.json and so on; not over an "
     "older backup, unless --force is given."_L1},
    {kOutputFileOption, "output"_L1, "FILE"_L1, "Write this file. Default: -, which is standard output."_L1},
    {kOutputFileOrFolderOption, "output"_L1, "FILE|FOLDER"_L1,
     "Write this file; default: -, which is standard output. Of several units, write files in this folder."_L1},
    {kForceOption, "force"_L1, {}, "Overwrite files that exist."_L1},
    {kYesToOtherUnitsOption, "yes"_L1, {}, "Write a file also where it was read from another unit."_L1},
    {kYesToQuestionOption, "yes"_L1, {}, "Do not ask before the ID is written."_L1},
    {kAloneOption, "alone"_L1, {}, "Do not search for other units first: the unit is connected alone."_L1},
    {kJsonOption, "json"_L1, {}, "Print one JSON document instead of text."_L1},
    {kQuietOption, "quiet"_L1, {}, "Show no progress."_L1},
    {kTraceOption, "trace"_L1, {}, "Print what crosses the line on standard error."_L1},
});

constexpr auto kCommands = std::to_array<CommandInfo>({
    {.command = Command::kPorts,
     .name = "ports"_L1,
     .arguments = {},
     .other_arguments = {},
     .summary = "List the comm ports."_L1,
     .description =
         "List the comm ports: number, device, the adapter with its maker and, where the system reports "
         "it, the program that holds the port."_L1,
     .options = kDemoOption | kJsonOption,
     .example = "ports"_L1},
    {.command = Command::kFind,
     .name = "find"_L1,
     .arguments = "[FIRST-LAST]"_L1,
     .other_arguments = {},
     .summary = "List the units that answer."_L1,
     .description =
         "Poll every ID from FIRST to LAST, by default from 01 to FD, and list the units that answer. All "
         "IDs take 25 seconds, on a noisy line twice that. The exit code is 1 when none answers, or one "
         "not as it should."_L1,
     .options = kLineOptions,
     .example = "find 01-20"_L1},
    {.command = Command::kGet,
     .name = "get"_L1,
     .arguments = "ID..."_L1,
     .other_arguments = {},
     .summary = "Read configurations out of units."_L1,
     .description =
         "Read the configuration of all eight ports out of each unit. That of one unit is printed on "
         "standard output, or written to the file of --output. Those of several units are written to "
         "files, unit-0A.json and so on, in the folder of --output or in the current one."_L1,
     .options = kLineOptions | kOutputFileOrFolderOption | kForceOption,
     .example = "get 0A --output wolf.json"_L1},
    {.command = Command::kSend,
     .name = "send"_L1,
     .arguments = "FILE ID..."_L1,
     .other_arguments = {},
     .summary = "Write a configuration into units."_L1,
     .description =
         "Write the configuration of FILE into each unit, read it back and compare, unit by unit. Where "
         "one fails, the next one follows. At the end a table has for each unit whether it is written and "
         "compared, and what differs or why it failed."_L1,
     .options = kLineOptions | kNoCompareOption | kBackupFolderOption | kForceOption,
     .example = "send wolf.json 0A-1F --backup before"_L1},
    {.command = Command::kCompare,
     .name = "compare"_L1,
     .arguments = "FILE ID..."_L1,
     .other_arguments = "FILE FILE"_L1,
     .summary = "Compare a configuration with units or with a file."_L1,
     .description =
         "Read each unit, and print where it differs from the configuration of FILE; or print where two "
         "files differ. Compared is what a unit can hold: it drops the last digit of a pulse width. "
         "Nothing is changed."_L1,
     .options = kLineOptions,
     .example = "compare wolf.json 0A-1F"_L1},
    {.command = Command::kBackup,
     .name = "backup"_L1,
     .arguments = "FOLDER [ID...]"_L1,
     .other_arguments = {},
     .summary = "Read all units into a folder."_L1,
     .description =
         "Read each unit and write its configuration to a file in FOLDER: unit-0A.json and so on. Without "
         "IDs, find the units on the line first."_L1,
     .options = kLineOptions | kForceOption,
     .example = "backup 2026-11-22"_L1},
    {.command = Command::kRestore,
     .name = "restore"_L1,
     .arguments = "FOLDER [ID...]"_L1,
     .other_arguments = {},
     .summary = "Write a backup back into its units."_L1,
     .description =
         "Write the files unit-0A.json and so on of FOLDER into the units that they are named after: all "
         "of them, or those of the IDs. A file whose \"unit\" is not that ID is not written unless --yes "
         "is given. Each unit is read back and compared, as send does it."_L1,
     .options = kLineOptions | kNoCompareOption | kBackupFolderOption | kForceOption | kYesToOtherUnitsOption,
     .example = "restore 2026-11-22 0A"_L1},
    {.command = Command::kSetId,
     .name = "set-id"_L1,
     .arguments = "NEW"_L1,
     .other_arguments = {},
     .summary = "Give the only unit on the line its ID."_L1,
     .description =
         "Give the unit that is connected alone the ID NEW, 01 to FD. It is written to FF, which addresses "
         "every unit: all that are connected would take the ID. So exactly one clean reply must come at FF "
         "first and, without --alone, no unit may answer from 01 to FD. You are asked before the ID is "
         "written; without a terminal, --yes is needed."_L1,
     .options = kLineOptions | kAloneOption | kYesToQuestionOption,
     .example = "set-id 0B"_L1},
    {.command = Command::kShow,
     .name = "show"_L1,
     .arguments = "FILE"_L1,
     .other_arguments = {},
     .summary = "Print a configuration as a table."_L1,
     .description = "Print the configuration of FILE as a table of its eight ports."_L1,
     .options = kJsonOption,
     .example = "show wolf.json"_L1},
    {.command = Command::kPreset,
     .name = "preset"_L1,
     .arguments = "NAME"_L1,
     .other_arguments = {},
     .summary = "Print or write the configuration of a preset."_L1,
     .description =
         "Print a configuration with a preset's values for all eight ports, or write it to the file of "
         "--output. NAME is narrow, medium or wide."_L1,
     .options = kOutputFileOption | kForceOption | kJsonOption,
     .example = "preset wide --output wide.json"_L1},
    {.command = Command::kMonitor,
     .name = "monitor"_L1,
     .arguments = {},
     .other_arguments = {},
     .summary = "Print what crosses the line."_L1,
     .description =
         "Print what crosses the line, with the time and the meaning of each packet, until Ctrl+C. Nothing "
         "is sent."_L1,
     .options = kPortOption | kTakePortOption | kDemoOption | kQuietOption,
     .example = "monitor --port 3"_L1},
});

constexpr auto kExitCodes = std::to_array<ExitCode>({
    {0, "Everything is as it should be."_L1},
    {1, "A unit differs, fails or does not answer, or a result cannot be written."_L1},
    {2, "Wrong use, or a file that cannot be read, is no configuration, or exists."_L1},
    {3, "The port cannot be opened."_L1},
    {129, "The terminal was closed (SIGHUP)."_L1},
    {130, "Ctrl+C was pressed (SIGINT)."_L1},
    {143, "The program was asked to end (SIGTERM)."_L1},
});

}  // namespace

std::span<const OptionInfo> Options() { return kOptions; }
std::span<const CommandInfo> Commands() { return kCommands; }
std::span<const ExitCode> ExitCodes() { return kExitCodes; }

const CommandInfo& InfoOf(Command command) {
  return *std::ranges::find(kCommands, command, &CommandInfo::command);
}

}  // namespace tendril::ctl
