// GetOperation: reads the configuration of all eight ports out of a unit.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>

#include "config/channel_config.h"
#include "unitops/unit_operation.h"

namespace tendril {

// Each poll of kind "n" is answered with one port of the unit's choice:
//
//   port 1..8 | its nine option bytes
//
// The ports are collected in a table of their own, which replaces the working configuration at one moment, when all
// eight are there.
//
//   Idle --Start: poll out--> Polling
//   Polling --a port is missing: next poll, up to 33 in all--> Polling
//   Polling --all ports are there--> Idle (success)
//   Polling --a port above 8, 33 polls spent, or a fault--> Idle (failed; the working configuration is as before)
class GetOperation final : public UnitOperation {
 public:
  // `working` is what is replaced; `on_replaced` (may be empty) is called with the unit right after that, while the
  // command still runs. Context and table must outlive the operation.
  GetOperation(CommandContext& context, ChannelTable& working,
               std::function<void(std::uint8_t unit)> on_replaced);

 protected:
  std::string Prepare() override;
  void Begin() override;
  void OnReply(bool replied, std::uint8_t unit, const Bytes& data) override;
  std::string Aftermath() const override;

 private:
  std::size_t ReceivedPorts() const;
  void ShowProgress();
  void ReplaceWorkingConfiguration(std::uint8_t unit);

  ChannelTable& working_;
  std::function<void(std::uint8_t)> on_replaced_;
  ChannelTable read_back_;
  bool replaced_ = false;
  std::int16_t repeats_ = 0;  // polls after the first
};

}  // namespace tendril
