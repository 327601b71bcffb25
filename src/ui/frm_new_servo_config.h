// frmNewServoConfig: the program's window.
#pragma once

#include <QMainWindow>
#include <QObject>
#include <QPointer>
#include <QStackedWidget>
#include <cstddef>
#include <cstdint>
#include <memory>

#include "config/channel_config.h"
#include "platform/message_boxes.h"
#include "platform/timer.h"
#include "serial/hw_serial.h"
#include "trace/line_trace.h"
#include "ui/actuals_frame.h"
#include "ui/apply_boxes.h"
#include "ui/channel_choices.h"
#include "ui/channel_strip.h"
#include "ui/chosen_servo.h"
#include "ui/command_area.h"
#include "ui/command_focus.h"
#include "ui/comparison_signs.h"
#include "ui/connection_area.h"
#include "ui/found_units.h"
#include "ui/freeze.h"
#include "ui/line_pane.h"
#include "ui/live_test_area.h"
#include "ui/main_menu.h"
#include "ui/model/edited_configuration.h"
#include "ui/model/readings.h"
#include "ui/motion_parameters.h"
#include "ui/program_info.h"
#include "ui/progress_area.h"
#include "ui/simulators.h"
#include "ui/status_line.h"
#include "ui/summary_area.h"
#include "ui/undo_history.h"
#include "ui/window_facts.h"
#include "unitops/control_panel.h"
#include "unitops/live_test.h"
#include "unitops/port_selection.h"
#include "unitops/shutdown.h"
#include "unitops/unit_commands.h"

namespace tendril {

// Lays out the areas, connects them with the program's operations, and runs start-up and shutdown.
class frmNewServoConfig : public QMainWindow {
 public:
  // Everything handed in must outlive the window. `link` and `control_panel` must have no other user.
  frmNewServoConfig(HwSerial& link, TimerFactory& timers, MessageBoxes& boxes, ControlPanel& control_panel,
                    const ProgramInfo& info);
  ~frmNewServoConfig() override;

  // The records that are edited, sent and shown.
  const ChannelTable& WorkingConfiguration() const { return config_.Records(); }

 protected:
  bool eventFilter(QObject* object, QEvent* event) override;
  void closeEvent(QCloseEvent* event) override;

 private:
  void LayOut();
  void ConnectAreas();
  void ConnectMenu();
  void ConnectOperations();
  void StartUp();
  void OnLine(const LineEvent& event);
  void ShowPort();
  void ChooseChannel(std::size_t channel);
  void SelectChannel(std::size_t channel);
  void ShowEditor();
  void OnEdited(const QString& what, FollowUp follow_up);
  void OnApplied();
  void OnKindChosen(std::int16_t kind);
  void OnPresetChosen(std::size_t preset);
  void ShowRecords();
  void ShowRemarks();
  void OnReplaced(const QString& what);
  void OnRead(std::uint8_t unit);
  void OnSent(std::uint8_t unit);
  void OnReport(const CommandReport& report);
  void OnCompared(std::uint8_t unit, const OptionTable& held);
  void OnBegun();
  void OnWriting();
  void RestoreReading();
  void Copy();
  void CopyConfiguration();
  void PasteConfiguration();
  void NoteStep(const QString& what, bool goes_on = false);
  void ShowOrigin();
  void ShowUndo();
  bool MayUndo() const;
  void Undo();
  void Redo();
  void ShowRestored(const QString& said);
  void CommitTyping();
  void OnNumberDropped(const QString& typed, const QString& sentence);
  void ForgetDropped();
  void NoteOutcome(const QString& sentence) { outcome_note_ += QLatin1Char(' ') + sentence; }
  bool MakeWayForCommand();
  void FindUnits();
  void SayUnitId();
  void ShowManual();
  LinePane& Line();
  void MakeSummary();
  void ShowSummary();
  void OnSummaryScreen();
  void ShowConfig();
  bool SummaryShown() const;
  void EnableControls();

  HwSerial& link_;
  TimerFactory& timers_;
  MessageBoxes& boxes_;
  ControlPanel& control_panel_;
  const ProgramInfo info_;
  LineTrace trace_;
  EditedConfiguration config_;
  UndoHistory history_{config_};
  Readings readings_;
  Comparison comparison_{config_.Records()};
  QString dropped_;         // what was typed last and could not be taken, until the next edit
  QString outcome_note_;    // what the status bar says after the outcome of the running command
  QString outcome_spoken_;  // what is read out after that
  PortSelection ports_;

  // Owned by the window, as its child widgets.
  ConnectionArea* connection_ = new ConnectionArea(ports_);
  ProgressArea* progress_ = new ProgressArea;
  CommandArea* command_area_ = new CommandArea;
  ApplyBoxes* apply_boxes_ = new ApplyBoxes(config_.Editor());
  ChannelStrip* channels_ = new ChannelStrip(config_.Records());
  ChosenServo* servo_ = new ChosenServo(config_.Editor(), config_.Records());
  MotionParameters* parameters_ = new MotionParameters(config_.Editor(), config_.Records(), comparison_);
  ChannelChoices* choices_ = new ChannelChoices(config_.Editor(), config_.Records(), comparison_);
  LiveTestArea* live_test_area_ = new LiveTestArea(*parameters_);
  QStackedWidget* views_ = new QStackedWidget;
  StatusLine* status_ = new StatusLine;
  MainMenu* menu_ = nullptr;
  ActualsFrame* actuals_;
  FoundUnits* found_units_ = nullptr;  // made when it is first needed
  LinePane* line_ = nullptr;           // made when it is first needed
  SummaryArea* summary_ = nullptr;     // made after the first paint, or when it is first needed

  UnitCommands commands_;
  Simulators simulators_{*channels_, *servo_, parameters_->Scale(), config_.Editor()};
  LiveTest live_test_;
  CommandFocus command_focus_{*this};
  ComparisonSigns compared_{comparison_, link_, *connection_, *channels_, *parameters_, *choices_, *status_};
  WindowFacts facts_{link_, *connection_, *servo_, commands_.running, *live_test_area_, *status_};
  QPointer<QWidget> focus_before_summary_;
  Freeze until_released_;  // the line, after a poll

  std::unique_ptr<Timer> tmrSummaryScreen_;
  Shutdown shutdown_;
  QObject connections_;  // the context of all connections: destroyed first, it ends them
};

}  // namespace tendril
