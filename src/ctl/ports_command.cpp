#include <QJsonArray>
#include <string>
#include <utility>
#include <vector>

#include "ctl/commands.h"
#include "ctl/port_list.h"
#include "ctl/text_table.h"

namespace tendril::ctl {
namespace {

using namespace Qt::StringLiterals;

QJsonObject ToJson(std::int16_t number, const DeviceDescription& device, const PortHolder& holder) {
  QJsonObject port{{u"number"_s, number}};
  const auto add = [&port](const QString& name, const std::string& value) {
    if (!value.empty()) port[name] = QString::fromStdString(value);
  };
  add(u"device"_s, device.path);
  add(u"adapter"_s, device.adapter);
  add(u"maker"_s, device.maker);
  if (holder.process == 0) return port;
  QJsonObject held_by{{u"process"_s, static_cast<qint64>(holder.process)}};
  if (!holder.program.empty()) held_by[u"program"_s] = QString::fromStdString(holder.program);
  port[u"heldBy"_s] = held_by;
  return port;
}

}  // namespace

Report Ports(Job& job) {
  const SerialDevice& device = job.environment.device;
  TextTable table({u"port"_s, u"device"_s, u"adapter"_s, u"maker"_s, u"held by"_s});
  QJsonArray ports;
  for (const std::int16_t number : ListedPorts(device)) {
    const DeviceDescription description = device.Describe(number);
    const PortHolder holder = device.Holder(number);
    ports += ToJson(number, description, holder);
    // A guess would help only where a port cannot be opened.
    const std::string held_by = holder.process == 0 ? "" : HolderName(holder);
    std::vector<TableCell> cells;
    for (const std::string& text :
         {CommName(number), description.path, description.adapter, description.maker, held_by})
      cells.push_back({text.empty() ? u"-"_s : QString::fromStdString(text)});
    table.AddRow(std::move(cells));
  }
  return {.text = ports.isEmpty() ? "There is no serial port: plug in the adapter.\n"
                                  : table.Text(job.environment.terminal),
          .members = {{u"ports"_s, ports}}};
}

}  // namespace tendril::ctl
