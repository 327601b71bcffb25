#include "ctl/port_list.h"

#include <cstddef>

namespace tendril::ctl {
namespace {

constexpr std::int16_t kLastPort = 255;

}  // namespace

std::vector<std::int16_t> ListedPorts(const SerialDevice& device) {
  std::vector<std::int16_t> numbers;
  for (std::int16_t number = 1; number <= kLastPort; ++number) {
    if (device.Exists(number)) numbers.push_back(number);
  }
  return numbers;
}

std::string PortNames(const std::vector<std::int16_t>& numbers, const std::string& joined) {
  std::string names;
  for (std::size_t i = 0; i < numbers.size(); ++i) {
    if (i > 0) names += i + 1 < numbers.size() ? ", " : " " + joined + " ";
    names += CommName(numbers[i]);
  }
  return names;
}

std::string HolderName(const PortHolder& holder) {
  if (holder.process == 0) return "another program";
  const std::string process = "process " + std::to_string(holder.process);
  return holder.program.empty() ? process : holder.program + " (" + process + ")";
}

}  // namespace tendril::ctl
