// UnitSession: the units on one port, for code that waits for each of its commands.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <utility>

#include "config/channel_config.h"
#include "config/option_bytes.h"
#include "ctl/environment.h"
#include "platform/message_boxes.h"
#include "serial/hw_serial.h"
#include "trace/line_trace.h"
#include "unitops/command_report.h"
#include "unitops/running_command.h"
#include "unitops/unit_commands.h"
#include "unitops/unit_search.h"
#include "unitops/unit_target.h"

namespace tendril::ctl {

// How a command ended. All texts are sentences in one line.
struct CommandResult {
  enum class Kind { kDone, kFailed, kCancelled };

  bool Done() const { return kind == Kind::kDone; }

  Kind kind = Kind::kFailed;
  std::string reason = {};     // kFailed: why, with what to do where that is known
  std::string aftermath = {};  // how the unit is left: "Ports 1 to 3 are written, 4 perhaps, 5 to 8 are not."
  SendOperation::Written written = SendOperation::Written::kNothing;  // by Send()
};

// The operations of the window, one at a time. Each call runs the event loop until its operation has ended. A stop
// request cancels the running one; while it stands, none begins.
class UnitSession final : private UnitTarget, private CommandProgressView, private MessageBoxes {
 public:
  // How far the running command is: "port 5 of 8", and as a part of the whole, 0 to 1.
  using StepHandler = std::function<void(const std::string& step, double part)>;

  // Takes the handler of the stop request. The environment must outlive it.
  explicit UnitSession(Environment& environment);
  ~UnitSession() override;
  UnitSession(const UnitSession&) = delete;
  UnitSession& operator=(const UnitSession&) = delete;

  // Polls `unit` until it answers, some times. Done: it does, and nothing else.
  CommandResult LookFor(std::uint8_t unit);
  // Writes `records` into `unit`, all ports.
  CommandResult Send(std::uint8_t unit, const ChannelTable& records);
  // Reads what `unit` holds into `held`, which stays as it was unless all ports were read. A reading in which a reply was
  // missing, or noise came, is done twice, and fails unless both are equal: replies have no checksum.
  CommandResult Read(std::uint8_t unit, OptionTable& held);
  // Polls the IDs from `first` to `last`. Search() has what was found, also after a failure.
  CommandResult Find(std::uint8_t first, std::uint8_t last,
                     std::int32_t first_poll_ms = FindOperation::kFirstPollMs);
  const UnitSearch& Search() const { return commands_.find.Search(); }
  // Gives the unit at FF the ID `new_id`.
  CommandResult SetId(std::uint8_t new_id);
  // Whether the last SetId() has sent the ID: the unit may have it.
  bool IdPerhapsChanged() const { return commands_.change_id.PerhapsChanged(); }

  void SetStepHandler(StepHandler handler) { on_step_ = std::move(handler); }
  // The line. Its port is opened elsewhere; while it is closed, no command begins.
  HwSerial& Link() { return link_; }
  // Follows the line. Its entries are cleared before each command.
  LineTrace& Trace() { return trace_; }

 private:
  CommandResult Run(std::uint8_t unit, UnitOperation& operation);
  void AwaitLateReplies();
  CommandResult ReadOnce(std::uint8_t unit, OptionTable& held);
  bool InDoubt() const;
  std::string Reason() const;
  void OnStop();
  void ReportStep() const;

  // UnitTarget
  bool PortChosen() const override { return true; }
  std::uint8_t UnitId() const override { return unit_; }
  // CommandProgressView
  void ShowProgress(bool /*shown*/) override {}
  int FrameWidth() const override;
  void SetBarWidth(int /*width*/) override {}
  void SetTitle(const std::string& title) override;
  void SetColour(ProgressColour colour) override;
  void SetText(const std::string& /*text*/) override {}
  // MessageBoxes
  void Show(const BoxMessage& message) override;
  bool AskYesNo(const BoxMessage& /*message*/) override { return false; }

  Environment& environment_;
  LineTrace trace_;
  HwSerial link_;
  StepHandler on_step_;

  // Of the running command, or the last one.
  std::uint8_t unit_ = 0;
  ChannelTable records_;
  std::optional<OptionTable> held_;
  std::string step_;
  std::string box_;  // the first one's text
  int replies_ = 0;
  int misses_ = 0;           // polls without a reply
  bool unanswered_ = false;  // a poll had no reply, since the line was last left alone
  bool succeeded_ = false;
  CommandReport report_;

  UnitCommands commands_;
};

}  // namespace tendril::ctl
