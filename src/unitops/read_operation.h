// ReadOperation: reads the configuration of all eight ports out of a unit.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

#include "config/option_bytes.h"
#include "unitops/unit_operation.h"

namespace tendril {

// The base of what reads a unit. Each poll of kind "n" is answered with one port of the unit's choice:
//
//   port 1..8 | its nine option bytes
//
// The ports are collected in tables of their own, which the derived class gets at one moment, when all eight are there.
//
//   Idle --Start: poll out--> Polling
//   Polling --a port is missing: next poll, up to 33 in all--> Polling
//   Polling --all ports are there--> Idle (success)
//   Polling --a port above 8, 33 polls spent, or a fault--> Idle (failed; nothing was passed on)
class ReadOperation : public UnitOperation {
 protected:
  // What tells the operations that read a unit apart.
  struct Texts {
    const char* what;        // "Reading unit "; the unit follows
    const char* fault;       // see UnitOperation
    const char* send_error;  // title of the boxes for a poll that cannot be sent, or was sent too often
    const char* data_error;  // title of the box for a reply that makes no sense
    const char* success;     // for the progress display
  };

  // `texts` and the context must outlive the operation.
  ReadOperation(CommandContext& context, const Texts& texts);

  std::string Prepare() override;
  void Begin() override;
  void OnReply(bool replied, std::uint8_t unit, const Bytes& data) override;

  // All ports of `unit` have been read: as records, each with the mark `Received`, and as the unit holds them. The
  // operation still runs.
  virtual void OnRead(std::uint8_t unit, const ChannelTable& records, const OptionTable& held) = 0;
  // Whether all ports have been read since the operation began.
  bool AllRead() const { return all_read_; }

 private:
  std::size_t ReceivedPorts() const;
  void ShowProgress();
  BoxMessage CannotPoll(const char* text) const { return {text, texts_.send_error, BoxIcon::kCritical}; }

  const Texts& texts_;
  ChannelTable read_back_;
  OptionTable held_{};
  bool all_read_ = false;
  std::int16_t repeats_ = 0;  // polls after the first
};

}  // namespace tendril
