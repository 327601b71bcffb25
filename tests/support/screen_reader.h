// ScreenReader: uses a program by what it puts on the accessibility bus, and by nothing else.
#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QObject>
#include <QProcess>
#include <QString>
#include <QTemporaryDir>
#include <functional>
#include <string>
#include <vector>

namespace tendril::test {

// The program runs on a display and on buses of its own, which end with it. What fails to start raises
// std::runtime_error.
class ScreenReader : public QObject {
  Q_OBJECT

 public:
  struct Object {
    QString service;
    QString path;
  };

  explicit ScreenReader(const QString& program);
  ~ScreenReader() override;

  // What all windows of the program are inside of.
  Object Program();
  // What `object` has inside, at any depth, with this role and name. Waits for it; raises std::runtime_error when it
  // does not appear.
  Object Find(const Object& object, const std::string& role, const std::string& name);
  std::string Name(const Object& object);
  std::string Role(const Object& object);
  std::string Text(const Object& object);
  // Carries out action `index` of the object; 0 presses it.
  void Act(const Object& object, int index = 0);

  // Whether something that contains this was heard, now or soon.
  bool Hears(const std::string& what);
  // What a reader reads out, in order: "focused NAME", "selected NAME", "notification NAME".
  std::vector<std::string> heard;

 private Q_SLOTS:
  void OnStateChanged(const QDBusMessage& event);

 private:
  QString FirstLineOf(QProcess& process, const QStringList& command);
  QVariant Call(const Object& object, const char* interface, const char* method,
                const QVariantList& values = {});
  std::vector<Object> Children(const Object& object);
  bool Search(const Object& object, const std::string& role, const std::string& name, Object& found);

  QTemporaryDir folder_;
  QProcess display_;
  QProcess session_;
  QProcess program_;
  QDBusConnection bus_{QString()};
};

}  // namespace tendril::test
