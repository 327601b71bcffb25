// SendOperation: writes the working configuration of all eight ports into a unit.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <utility>

#include "config/channel_config.h"
#include "unitops/unit_operation.h"

namespace tendril {

// Port by port: the options, then a poll of kind "0" until the unit acknowledges (one poll, and two more when no reply
// comes), then a pause, then the next port.
//
//   Idle --Start: options and poll out--> Polling
//   Polling --acknowledged--> Pausing
//   Polling --wrong reply, or third poll unanswered--> Idle (failed)
//   Pausing --300 ms: next port's options and poll out--> Polling
//   Pausing --300 ms after port 8--> Idle (success)
//   Idle, Pausing --a field is invalid--> Idle
//   any --a fault--> Idle
class SendOperation final : public UnitOperation {
 public:
  // How much of the configuration is in the unit. kPerhaps: port 1 is perhaps written, and no other.
  enum class Written { kNothing, kPerhaps, kPart, kAll };

  // `working` are the records that are sent; `on_sent` (may be empty) is called with the unit when it has accepted the
  // last of them, while the command still runs. Context and records must outlive the operation.
  SendOperation(CommandContext& context, const ChannelTable& working,
                std::function<void(std::uint8_t unit)> on_sent);

  // Whether a send has begun to write into its unit, or perhaps has, since the last call. A send can do so and then not
  // be able to run.
  bool TakeWriting() { return (written_ > 0 || perhaps_written_) && !std::exchange(writing_taken_, true); }

  // What the send that runs, or the last one, has written.
  Written WhatIsWritten() const;

  // Encodes the record of slot `port_index` and sends it as options to the chosen unit. False: a field is invalid,
  // which has been shown, and nothing was sent. Raises what the link raises, and kErrOutOfRange for an index above 8.
  bool EncodeAndSendPort(std::uint8_t port_index);

 protected:
  std::string Prepare() override;
  void Begin() override;
  void OnReply(bool replied, std::uint8_t unit, const Bytes& data) override;
  void OnLastReply(bool replied, const Bytes& data) override;
  std::string Aftermath() const override;

 private:
  void OnNextPort();
  void ShowPort() {
    ShowStep("port " + std::to_string(port_index_ + 1) + " of " + std::to_string(kPortCount));
  }

  const ChannelTable& working_;
  std::function<void(std::uint8_t)> on_sent_;
  Timer& tmrDownload_;  // enabled in the pause between two ports
  std::uint8_t unit_ = 0;
  std::uint8_t port_index_ = 0;
  std::int32_t written_ = 0;      // ports whose options the unit has accepted
  bool perhaps_written_ = false;  // the next port's options may have gone out
  bool writing_taken_ = false;
  std::int32_t unanswered_ = 0;  // polls of the current port without a reply
};

}  // namespace tendril
