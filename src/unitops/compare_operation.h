// CompareOperation: reads the configuration of all eight ports out of a unit, to be compared.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <utility>

#include "unitops/read_operation.h"

namespace tendril {

// Reads as GetOperation does, and changes no record.
class CompareOperation final : public ReadOperation {
 public:
  // `on_compared` (may be empty) is called with the unit and what it holds, while the command still runs. The context
  // must outlive the operation.
  CompareOperation(CommandContext& context,
                   std::function<void(std::uint8_t unit, const OptionTable& held)> on_compared);

  // Whether a compare has ended without a result, or was not able to begin, since the last call.
  bool TakeFailure() { return std::exchange(failed_, false); }

 protected:
  std::string Prepare() override;
  void OnRead(std::uint8_t unit, const ChannelTable& records, const OptionTable& held) override;
  std::string Aftermath() const override;

 private:
  // The boxes say what those of a get do, and name the command.
  static constexpr Texts kTexts{"Comparing unit ", "Compare Failed", "Compare", "Compare",
                                "SUCCESS: Compare Complete"};

  std::function<void(std::uint8_t, const OptionTable&)> on_compared_;
  bool failed_ = false;  // until all ports are read
};

}  // namespace tendril
