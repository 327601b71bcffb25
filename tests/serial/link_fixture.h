// A serial link on a recording device, in simulated time.
#pragma once

#include <gmock/gmock.h>

#include <string>
#include <vector>

#include "serial/hw_serial.h"
#include "support/failure_of.h"
#include "support/memory_log.h"
#include "support/recording_device.h"
#include "support/simulated_time.h"

namespace tendril::test {

struct ReportedReply {
  bool success;
  int unit;
  int code;
  Bytes data;
  friend bool operator==(const ReportedReply&, const ReportedReply&) = default;
};

class LinkFixture : public testing::Test {
 protected:
  LinkFixture() {
    link_.SetPollReplyHandler([this](bool success, std::uint8_t unit, std::uint8_t code, Bytes& data) {
      replies_.push_back({success, unit, code, data});
    });
    link_.SetTraceSink([this](const std::string& line) { traces_.push_back(line); });
    link_.SetCommPort(3);
    link_.SetBaudRate(19200);
  }

  SimulatedTime time_{0xFFFF'FFFF - 40};  // soon wraps
  RecordingDevice device_;
  MemoryLog log_;
  HwSerial link_{device_, time_, time_, log_};
  std::vector<ReportedReply> replies_;
  std::vector<std::string> traces_;
};

}  // namespace tendril::test
