// The commands of tendril-ctl with their options, in words. The command line is read by this table, the help is printed
// from it, and the shell completion and the man page are checked against it.
#pragma once

#include <QLatin1StringView>
#include <span>

namespace tendril::ctl {

enum class Command {
  kPorts,
  kFind,
  kGet,
  kSend,
  kCompare,
  kBackup,
  kRestore,
  kSetId,
  kShow,
  kPreset,
  kMonitor
};

// Bits: the options that a command has. Two bits may share a name where commands give it different meanings.
enum Option : unsigned {
  kPortOption = 1u << 0,
  kTakePortOption = 1u << 1,
  kDemoOption = 1u << 2,
  kTraceOption = 1u << 3,
  kQuietOption = 1u << 4,
  kJsonOption = 1u << 5,
  kOutputFileOption = 1u << 6,
  kOutputFileOrFolderOption = 1u << 7,
  kBackupFolderOption = 1u << 8,
  kForceOption = 1u << 9,
  kNoCompareOption = 1u << 10,
  kYesToOtherUnitsOption = 1u << 11,
  kYesToQuestionOption = 1u << 12,
  kAloneOption = 1u << 13,
};

struct OptionInfo {
  Option option;
  QLatin1StringView name;         // without "--"
  QLatin1StringView value;        // "FILE"; empty: the option takes none
  QLatin1StringView description;  // a sentence
};

struct CommandInfo {
  Command command;
  QLatin1StringView name;
  QLatin1StringView arguments;        // "FILE ID..."
  QLatin1StringView other_arguments;  // a second form; empty: there is none
  QLatin1StringView summary;          // a line
  QLatin1StringView description;      // sentences
  unsigned options;                   // bits of Option
  QLatin1StringView example;
};

struct ExitCode {
  int code;
  QLatin1StringView meaning;
};

// In the order of the help.
std::span<const OptionInfo> Options();
std::span<const CommandInfo> Commands();
std::span<const ExitCode> ExitCodes();

// The row of `command`.
const CommandInfo& InfoOf(Command command);

}  // namespace tendril::ctl
