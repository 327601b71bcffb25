// SendOperation: writes the working configuration of all eight ports into a unit.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

#include "config/channel_config.h"
#include "platform/bytes.h"
#include "platform/timer.h"
#include "unitops/command_context.h"

namespace tendril {

// Port by port: the options, then a poll of kind "0" until the unit acknowledges (once, and twice more when
// nothing is heard), then a pause, then the next port.
//
//   Idle --Start: options and poll out--> Polling
//   Polling --acknowledged--> Pausing
//   Polling --wrong reply, or third poll unanswered--> Idle (failed)
//   Pausing --300 ms: next port's options and poll out--> Polling
//   Pausing --300 ms after port 8--> Idle (success)
//   Idle, Pausing --a field is invalid--> Idle
//   any --a fault--> Idle
class SendOperation {
 public:
  // The poll kind of an acknowledgement.
  static constexpr std::uint8_t kAcknowledgePoll = '0';

  // `working` are the records that are sent; both must outlive the operation.
  SendOperation(CommandContext& context, TimerFactory& timers, const ChannelTable& working);

  // "SEND(write) Configuration". Shows every failure; raises none.
  void Start();
  // The reply, or its absence, to a poll of kind "0". May raise.
  void OnPollReply(bool replied, std::uint8_t unit, const Bytes& data);
  // Stops where it is and shows nothing: the window is closing.
  void Stop();

  // Checks the record of slot `port_index` and hands it on as options to the unit that is chosen. False: a
  // field is invalid; the person has been told, and nothing was sent. Raises what the link raises, and
  // kErrOutOfRange for an index above 8.
  bool EncodeAndSendPort(std::uint8_t port_index);

 private:
  void OnNextPort();
  void Abort();
  void Fail(const std::string& text, const std::string& title);
  void ShowFault(const std::string& description);

  CommandContext& context_;
  const ChannelTable& working_;
  std::unique_ptr<Timer> next_port_timer_;
  std::uint8_t port_index_ = 0;
  std::int32_t unanswered_ = 0;  // polls of the current port without a reply
};

}  // namespace tendril
