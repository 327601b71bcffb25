// UnitOperation: a command that runs against a unit.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

#include "platform/bytes.h"
#include "platform/message_boxes.h"
#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "unitops/running_command.h"
#include "unitops/unit_target.h"

namespace tendril {

// What every operation works with. All of it outlives the operations.
struct CommandContext {
  HwSerial& link;
  TimerFactory& timers;
  MessageBoxes& boxes;
  RunningCommand& running;
  const UnitTarget& target;
  // Called before an operation starts and sends anything. False: it must not start; the reason has been shown.
  // May be empty; raises nothing.
  std::function<bool()> starting;
};

// Shows a fault. `failure` is the first line of the box; empty for none.
void ShowCommError(MessageBoxes& boxes, const std::string& failure, const std::string& description);

// The base of all operations. It ends an operation in one way: timer off, RunningCommand settled, and only then a
// message box, since a box runs the event loop and the user can start the next operation from there.
//
//   Idle --Start: Begin() calls Run()--> Running
//   Running --Succeed, Fail, StopAt, Stop, or a fault in a reply or a tick--> Idle
//   Running --Cancel--> Idle, or, while a poll is outstanding, Cancelled
//   Cancelled --the poll has ended, or a tick--> Idle
class UnitOperation {
 public:
  virtual ~UnitOperation() = default;

  // Starts the operation, unless one runs already, no port is chosen or the context objects. Shows every failure;
  // raises none.
  void Start();
  // Ends the operation where it is and shows nothing: the window is closing.
  void Stop();
  // Ends the operation at the user's wish, as failed and without a box: at once, or when the outstanding poll has ended.
  void Cancel();

  // The reply, or its absence, to a poll. Polls of other kinds belong to an operation that has ended: they are ignored.
  // Shows every failure; raises none.
  void OnPollReply(bool replied, std::uint8_t unit, std::uint8_t kind, const Bytes& data);

 protected:
  // `poll_kinds`: the kinds of this operation's polls, one character each. `fault_text`: the first line of the box that
  // shows a fault of Begin() or a tick; empty for none.
  UnitOperation(CommandContext& context, std::string_view poll_kinds, std::string fault_text);

  // Sets the operation back to its beginning, for the unit that is chosen now. Returns what it does: see
  // RunningCommand::What().
  virtual std::string Prepare() = 0;
  // Sends the first packets and calls Run(); or calls Refuse() or StopAt(). May raise.
  virtual void Begin() = 0;
  // The reply to a poll of the operation's own kinds. May raise.
  virtual void OnReply(bool replied, std::uint8_t unit, const Bytes& data) = 0;

  // The reply to the poll that was outstanding at Cancel(). Nothing follows it.
  virtual void OnLastReply(bool /*replied*/, const Bytes& /*data*/) {}
  // How the unit or the configuration is left when the operation ends now: a sentence. Valid from Prepare() on.
  virtual std::string Aftermath() const = 0;

  // The operation's timer, at most one: disabled, and disabled again when the operation ends. `on_tick` may raise.
  Timer& MakeTimer(std::int32_t interval_ms, std::function<void()> on_tick);

  // The operation runs from now on.
  void Run() { context_.running.StartCommandProgress(*this, what_); }
  // The operation cannot begin: shows `box`.
  void Refuse(const BoxMessage& box);
  // See RunningCommand::ShowStep().
  void ShowStep(const std::string& step, std::optional<double> part = {}) {
    context_.running.ShowStep(step, part);
  }
  // Ends the operation and shows `text` in the progress display.
  void Succeed(const std::string& text);
  // Ends the operation as failed and shows `box`.
  void Fail(const BoxMessage& box);
  // Ends the operation without an outcome in the progress display, or before it has begun. `where`: see
  // RunningCommand::StopAt().
  void StopAt(const std::string& where);

  // Runs `command`, which sends one configuration command after its unlock, and may raise. Sets `perhaps` to whether
  // the unit may have got it.
  void SendUnlocked(bool& perhaps, const std::function<void()>& command);

  HwSerial& Link() const { return context_.link; }
  // The unit ID that is chosen now.
  std::uint8_t UnitId() const { return context_.target.UnitId(); }
  // The box for a poll that the link refuses.
  static BoxMessage SendError(std::string text) {
    return {std::move(text), "Send Error", BoxIcon::kCritical};
  }
  // Shows a box and ends nothing.
  void Show(const BoxMessage& box) const { context_.boxes.Show(box); }

 private:
  bool MayStart() const;
  void Abort();
  void StopTimer();

  CommandContext& context_;
  std::string_view poll_kinds_;
  std::string fault_text_;
  std::string what_;
  std::unique_ptr<Timer> timer_;  // nullptr when the operation has none
};

}  // namespace tendril
