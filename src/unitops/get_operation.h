// GetOperation: reads the configuration of all eight ports out of a unit into the working configuration.
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "config/channel_config.h"
#include "unitops/read_operation.h"

namespace tendril {

// The working configuration is replaced at one moment, or stays as it was.
class GetOperation final : public ReadOperation {
 public:
  // `working` is what is replaced; `on_replaced` (may be empty) is called with the unit right after that, while the
  // command still runs. Context and table must outlive the operation.
  GetOperation(CommandContext& context, ChannelTable& working,
               std::function<void(std::uint8_t unit)> on_replaced);

 protected:
  void OnRead(std::uint8_t unit, const ChannelTable& records, const OptionTable& held) override;
  std::string Aftermath() const override;

 private:
  static constexpr Texts kTexts{"Reading unit ", "Upload Failed", "Send Error", "Error",
                                "SUCCESS: Upload Complete"};

  ChannelTable& working_;
  std::function<void(std::uint8_t)> on_replaced_;
};

}  // namespace tendril
