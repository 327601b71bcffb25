// The command line of tendril-bench.
#pragma once

#include <QCoreApplication>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <optional>
#include <vector>

#include "bench/faulty_units.h"
#include "bench/virtual_control_panel.h"

namespace tendril {

struct BenchUnit {
  std::uint8_t id = 0;
  const FaultKind* fault = nullptr;  // null: a well-behaved unit
};

struct BenchPanelOptions {
  std::uint16_t tcp_port = 0;                                     // 0: the system chooses
  std::uint8_t comm_port = 0;                                     // the number of the bench's own
  const PanelBehaviourKind* behaviour = nullptr;                  // null: a well-behaved panel
  std::optional<std::size_t> misbehaving_replies = std::nullopt;  // without a value all
};

struct BenchOptions {
  std::vector<BenchUnit> units;
  std::filesystem::path link;
  bool echo = true;
  bool quiet = false;
  std::optional<BenchPanelOptions> panel;
};

// Reads the command line of `application`. Ends the process for --help, --version and unknown options. Raises
// std::invalid_argument for invalid values.
BenchOptions ParseBenchOptions(const QCoreApplication& application);

}  // namespace tendril
