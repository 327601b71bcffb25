// ClientWorld: a comm listener client in virtual time; the test is its listener.
#pragma once

#include <gmock/gmock.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "commlistener/comm_listener_interface.h"
#include "support/scripted_socket.h"
#include "support/simulated_time.h"

namespace tendril::test {

struct ClientWorld {
  ClientWorld() {
    client.SetEvents({.CommReply =
                          [this](const Bytes& payload, std::int32_t status) {
                            EXPECT_LE(payload.capacity(), 2 * kMaxFrame) << "a flood is kept";
                            Note("reply " + std::to_string(status) + " " +
                                 std::string(payload.begin(), payload.end()));
                          },
                      .CommError =
                          [this](std::int32_t code, const std::string& message, std::int32_t number,
                                 const std::string& description) {
                            Note("error " + std::to_string(code) + " " + message + "|" +
                                 std::to_string(number) + "|" + description);
                          },
                      .CommConnected = [this] { Note("connected"); },
                      .CommClosed = [this] { Note("closed"); },
                      .CommStateChanged = [this] { Note("state"); }});
    client.InitializeControls(&socket, connect_timer_.get(), reconnect_timer_.get(), request_timer_.get());
  }

  void Note(std::string event) { events.push_back(std::move(event)); }
  std::vector<std::string> Events() { return std::exchange(events, {}); }

  void Connect() { client.Connect(false, "x", false, true); }
  // Connects, and has the identification acknowledged, which takes the sequence character "0".
  void ConnectIdle() {
    Connect();
    socket.Accept();
    socket.Deliver("1000000");
    EXPECT_TRUE(client.ReadyToTransmit());
    EXPECT_EQ(time.RunningTimers(), 0);
    socket.Take();
    Events();
  }

  // Lets the next attempt after a failure succeed.
  void Reconnected() {
    EXPECT_TRUE(client.Closed());
    EXPECT_EQ(time.RunningTimers(), 1);
    time.Advance(static_cast<std::uint64_t>(client.CommReconnectTime()));
    EXPECT_EQ(client.TCPState(), TcpState::kConnecting);
    socket.Accept();
    EXPECT_TRUE(client.IsConnected());
  }

  static Bytes Frame(std::string_view header, const Bytes& payload = {}) {
    Bytes frame = BytesOf(header);
    frame.insert(frame.end(), payload.begin(), payload.end());
    return frame;
  }

  SimulatedTime time;
  ScriptedSocket socket;
  std::unique_ptr<Timer> connect_timer_ = time.CreateTimer([this] { client.OnConnectTimer(); });
  std::unique_ptr<Timer> reconnect_timer_ = time.CreateTimer([this] { client.OnReconnectTimer(); });
  std::unique_ptr<Timer> request_timer_ = time.CreateTimer([this] { client.OnRequestTimer(); });
  CommListenerInterface client;     // destroyed before the timers
  std::vector<std::string> events;  // since Events() was called last
};

class ClientTest : public testing::Test, public ClientWorld {};

}  // namespace tendril::test
