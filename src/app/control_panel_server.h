// ControlPanelServer: a VirtualControlPanel on a real TCP port.
#pragma once

#include <QTcpServer>
#include <cstdint>
#include <functional>
#include <string>

#include "bench/virtual_control_panel.h"

class QTcpSocket;

namespace tendril {

class ControlPanelServer {
 public:
  // Listens on 127.0.0.1 at `port`; 0 lets the system choose one. `note` gets a sentence for each connection that
  // begins or ends. Raises std::runtime_error when the port is not available. The panel must outlive the server.
  ControlPanelServer(VirtualControlPanel& panel, std::uint16_t port,
                     std::function<void(const std::string&)> note);

  // Where it listens.
  std::uint16_t port() const { return server_.serverPort(); }

 private:
  void Accept(QTcpSocket* socket);

  VirtualControlPanel& panel_;
  std::function<void(const std::string&)> note_;
  QTcpServer server_;
};

}  // namespace tendril
