// The command line of tendril-ctl.
#pragma once

#include <QString>
#include <QStringList>
#include <cstdint>
#include <variant>
#include <vector>

#include "config/channel_config.h"
#include "ctl/command_table.h"
#include "unitops/unit_target.h"

namespace tendril::ctl {

// What is to be done. What a command does not have keeps its default.
struct CommandLine {
  Command command = Command::kPorts;
  std::vector<std::uint8_t> units;    // ID..., each once; none given: empty
  std::uint8_t first = kFirstUnitId;  // find
  std::uint8_t last = kLastUnitId;
  QString file;
  QString other_file;  // compare FILE FILE; empty: it is compared with units
  QString folder;      // backup, restore
  std::uint8_t new_id = 0;
  const Preset* preset = nullptr;
  std::int16_t port = 0;  // 0: the only one
  bool json = false;
  bool quiet = false;
  bool trace = false;
  bool compare = true;  // after a write
  bool take_port = false;
  bool demo = false;
  bool force = false;
  bool yes = false;
  bool alone = false;
  QString output;  // empty: standard output, or the current folder
  QString backup;
};

// The program ends at once: for --help and --version with exit code 0 and a text for standard output, after wrong use
// with 2 and a sentence for standard error.
struct EarlyEnd {
  int exit_code = 0;
  QString text;
};

// Reads the arguments; the first one is the program.
std::variant<CommandLine, EarlyEnd> ParseCommandLine(const QStringList& arguments);

// "set-id".
QString CommandName(Command command);

}  // namespace tendril::ctl
