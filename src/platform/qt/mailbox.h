// Mailbox: calls into the program that the event loop makes later.
#pragma once

#include <QCoreApplication>
#include <QObject>
#include <functional>
#include <utility>

#include "platform/qt/fault_handler.h"

namespace tendril {

// An adapter never calls its owner from inside an I/O signal: a message box that the owner opens there would block
// reception. It posts the call instead. A posted call may do anything: run the event loop, fail, post again, or destroy
// the mailbox.
class Mailbox {
 public:
  // `on_fault` gets the failures of the calls.
  explicit Mailbox(FaultHandler on_fault) : on_fault_(std::move(on_fault)) {}

  // Makes `call` from the event loop, after those that were posted before.
  void Post(std::function<void()> call) {
    QMetaObject::invokeMethod(
        &context_, [on_fault = on_fault_, call = std::move(call)] { CallGuarded(on_fault, call); },
        Qt::QueuedConnection);
  }

  // Drops the calls that wait.
  void Clear() { QCoreApplication::removePostedEvents(&context_); }

 private:
  FaultHandler on_fault_;
  QObject context_;  // the calls that wait end with it
};

}  // namespace tendril
