// GetOperation: reads the configuration of all eight ports out of a unit.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "config/channel_config.h"
#include "platform/bytes.h"
#include "unitops/command_context.h"

namespace tendril {

// Each poll of kind "n" is answered with one port of the unit's choice:
//
//   port 1..8 | its nine option bytes
//
// The ports are collected in a table of their own, which replaces the working configuration at one moment,
// when all eight are there.
//
//   Idle --Start: poll out--> Polling
//   Polling --a port is missing: next poll, up to 33 in all--> Polling
//   Polling --all ports are there--> Idle (success)
//   Polling --a port above 8, 33 polls spent, or a fault--> Idle (failed; the working configuration is as before)
class GetOperation {
 public:
  // The poll kind that asks for the configuration of a port.
  static constexpr std::uint8_t kConfigurationPoll = 'n';

  // `working` is what is replaced; `on_replaced` is called each time right after, while the command still
  // runs. Context and table must outlive the operation.
  GetOperation(CommandContext& context, ChannelTable& working, std::function<void()> on_replaced);

  // "GET(read) Configuration". Shows every failure; raises none.
  void Start();
  // The reply, or its absence, to a poll of kind "n". May raise.
  void OnPollReply(bool replied, const Bytes& data);

 private:
  bool HasAllPorts() const;
  void ReplaceWorkingConfiguration();
  void Fail(const std::string& text, const std::string& title, BoxIcon icon);

  CommandContext& context_;
  ChannelTable& working_;
  std::function<void()> on_replaced_;
  ChannelTable read_back_;
  std::int16_t repeats_ = 0;  // polls after the first
};

}  // namespace tendril
