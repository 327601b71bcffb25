#include "support/screen_reader.h"

#include <QDBusArgument>
#include <QDBusObjectPath>
#include <QDBusVariant>
#include <QProcessEnvironment>
#include <QTest>
#include <algorithm>
#include <stdexcept>

namespace tendril::test {
namespace {

constexpr int kMaxWaitMs = 30000;
constexpr char kAccessible[] = "org.a11y.atspi.Accessible";
const ScreenReader::Object kDesktop{QStringLiteral("org.a11y.atspi.Registry"),
                                    QStringLiteral("/org/a11y/atspi/accessible/root")};

}  // namespace

ScreenReader::ScreenReader(const QString& program) {
  auto environment = QProcessEnvironment::systemEnvironment();
  for (const char* folder : {"XDG_RUNTIME_DIR", "XDG_CONFIG_HOME", "HOME"})
    environment.insert(QString::fromLatin1(folder), folder_.path());
  display_.setProcessEnvironment(environment);
  const QString number =
      FirstLineOf(display_, {QStringLiteral("Xvfb"), QStringLiteral("-displayfd"), QStringLiteral("1"),
                             QStringLiteral("-screen"), QStringLiteral("0"), QStringLiteral("1366x900x24")});
  environment.insert(QStringLiteral("DISPLAY"), QLatin1Char(':') + number);
  session_.setProcessEnvironment(environment);
  const QString session =
      FirstLineOf(session_, {QStringLiteral("dbus-daemon"), QStringLiteral("--session"),
                             QStringLiteral("--nofork"), QStringLiteral("--print-address")});

  const auto on = [](const QString& address) { return QDBusConnection::connectToBus(address, address); };
  bus_ = on(session);
  const QString address =
      Call({QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus")}, "org.a11y.Bus", "GetAddress")
          .toString();
  bus_ = on(address);
  bus_.connect({}, {}, QStringLiteral("org.a11y.atspi.Event.Object"), QStringLiteral("StateChanged"), this,
               SLOT(OnStateChanged(QDBusMessage)));
  Call({kDesktop.service, QStringLiteral("/org/a11y/atspi/registry")}, "org.a11y.atspi.Registry",
       "RegisterEvent", {QStringLiteral("object:state-changed")});

  environment.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"), session);
  environment.insert(QStringLiteral("QT_QPA_PLATFORM"), QStringLiteral("xcb"));
  environment.insert(QStringLiteral("QT_LINUX_ACCESSIBILITY_ALWAYS_ON"), QStringLiteral("1"));
  program_.setProcessEnvironment(environment);
  program_.setProcessChannelMode(QProcess::ForwardedChannels);
  program_.start(program, {});
  // Without a window manager no window gets the focus by itself.
  QProcess focus;
  focus.setProcessEnvironment(environment);
  FirstLineOf(focus, {QStringLiteral("xdotool"), QStringLiteral("search"), QStringLiteral("--sync"),
                      QStringLiteral("--onlyvisible"), QStringLiteral("--name"), QStringLiteral("Tendril"),
                      QStringLiteral("windowfocus"), QStringLiteral("getwindowfocus")});
}

ScreenReader::~ScreenReader() {
  for (QProcess* process : {&program_, &session_, &display_}) {
    process->terminate();
    process->waitForFinished(kMaxWaitMs);
  }
}

QString ScreenReader::FirstLineOf(QProcess& process, const QStringList& command) {
  process.start(command.first(), command.mid(1));
  while (process.state() != QProcess::NotRunning && !process.canReadLine()) {
    if (!process.waitForReadyRead(kMaxWaitMs)) break;
  }
  const QByteArray line = process.readLine().trimmed();
  if (line.isEmpty()) throw std::runtime_error("Cannot be started: " + command.first().toStdString());
  return QString::fromLocal8Bit(line);
}

// The first value of the reply; invalid when there is none.
QVariant ScreenReader::Call(const Object& object, const char* interface, const char* method,
                            const QVariantList& values) {
  auto call = QDBusMessage::createMethodCall(object.service, object.path, QString::fromLatin1(interface),
                                             QString::fromLatin1(method));
  call.setArguments(values);
  const QVariantList reply = bus_.call(call, QDBus::Block, kMaxWaitMs).arguments();
  return reply.value(0);
}

std::string ScreenReader::Name(const Object& object) {
  return Call(object, "org.freedesktop.DBus.Properties", "Get",
              {QString::fromLatin1(kAccessible), QStringLiteral("Name")})
      .value<QDBusVariant>()
      .variant()
      .toString()
      .toStdString();
}

std::string ScreenReader::Role(const Object& object) {
  return Call(object, kAccessible, "GetRoleName").toString().toStdString();
}

std::string ScreenReader::Text(const Object& object) {
  return Call(object, "org.a11y.atspi.Text", "GetText", {0, -1}).toString().toStdString();
}

void ScreenReader::Act(const Object& object, int index) {
  Call(object, "org.a11y.atspi.Action", "DoAction", {index});
}

std::vector<ScreenReader::Object> ScreenReader::Children(const Object& object) {
  std::vector<Object> children;
  const auto list = Call(object, kAccessible, "GetChildren").value<QDBusArgument>();
  if (list.currentType() != QDBusArgument::ArrayType) return children;
  for (list.beginArray(); !list.atEnd();) {
    QDBusObjectPath path;
    list.beginStructure();
    list >> children.emplace_back().service >> path;
    list.endStructure();
    children.back().path = path.path();
  }
  list.endArray();
  return children;
}

ScreenReader::Object ScreenReader::Program() {
  std::vector<Object> programs;
  if (!QTest::qWaitFor([&] { return !(programs = Children(kDesktop)).empty(); }, kMaxWaitMs))
    throw std::runtime_error("The program is not on the bus");
  return programs.front();
}

bool ScreenReader::Search(const Object& object, const std::string& role, const std::string& name,
                          Object& found) {
  if (Name(object) == name && Role(object) == role) {
    found = object;
    return true;
  }
  const std::vector<Object> children = Children(object);
  return std::any_of(children.begin(), children.end(),
                     [&](const Object& child) { return Search(child, role, name, found); });
}

ScreenReader::Object ScreenReader::Find(const Object& object, const std::string& role,
                                        const std::string& name) {
  Object found;
  if (!QTest::qWaitFor([&] { return Search(object, role, name, found); }, kMaxWaitMs))
    throw std::runtime_error("There is no " + role + " " + name);
  return found;
}

bool ScreenReader::Hears(const std::string& what) {
  const auto contains = [&what](const std::string& sentence) {
    return sentence.find(what) != std::string::npos;
  };
  return QTest::qWaitFor([&] { return std::any_of(heard.begin(), heard.end(), contains); }, kMaxWaitMs);
}

void ScreenReader::OnStateChanged(const QDBusMessage& event) {
  const Object source{event.service(), event.path()};
  const std::string state = event.arguments().value(0).toString().toStdString();
  if (event.arguments().value(1).toInt() != 1) return;
  if (state == "focused" || state == "selected") {
    heard.push_back(state + " " + Name(source));
  } else if (state == "showing" && Role(source) == "notification") {
    heard.push_back("notification " + Name(source));
  }
}

}  // namespace tendril::test
