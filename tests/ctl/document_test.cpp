// The documents of --json against their schema.
#include <QDir>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QRegularExpression>
#include <map>
#include <set>

#include "ctl/ctl_fixture.h"

namespace tendril::test {
namespace {

class Documents : public CtlTest {
 protected:
  Documents() {
    QDir::setCurrent(folder_.path());
    QFile file(QStringLiteral(TENDRIL_SOURCES "/docs/tendril-ctl.schema.json"));
    if (file.open(QIODevice::ReadOnly)) schema_ = QJsonDocument::fromJson(file.readAll()).object();
    Note(schema_, described_);
    for (const QJsonValue& definition : schema_[u"$defs"].toObject()) Note(definition.toObject(), described_);
  }

  void ExpectDocument(const char* arguments) {
    SCOPED_TRACE(arguments);
    const int exit_code = Run(std::string(arguments) + " --json");
    const QJsonValue document = QJsonDocument::fromJson(QByteArray::fromStdString(terminal_.out)).object();
    EXPECT_EQ(document[u"exitCode"].toInt(-1), exit_code);
    Check(document, schema_);
  }

  std::set<std::string> described_;
  std::set<std::string> seen_{"device", "maker"};  // a virtual port has none

 private:
  // The names that `schema` gives members, those of objects within it too.
  static void Note(const QJsonObject& schema, std::set<std::string>& names) {
    const QJsonObject properties = schema[u"properties"].toObject();
    for (const QString& name : properties.keys()) {
      names.insert(name.toStdString());
      Note(properties[name].toObject(), names);
    }
  }
  void Check(const QJsonValue& value, QJsonObject schema) {
    const QString reference = schema[u"$ref"].toString();
    if (reference.endsWith(u".json")) return;  // a configuration, which has its own
    if (!reference.isEmpty()) schema = schema_[u"$defs"][reference.section(u'/', -1)].toObject();
    static const std::map<QString, QJsonValue::Type> kTypes{{QStringLiteral("object"), QJsonValue::Object},
                                                            {QStringLiteral("array"), QJsonValue::Array},
                                                            {QStringLiteral("string"), QJsonValue::String},
                                                            {QStringLiteral("integer"), QJsonValue::Double}};
    const QString type = schema[u"type"].toString();
    EXPECT_TRUE(type.isEmpty() || kTypes.at(type) == value.type()) << terminal_.out;
    EXPECT_TRUE(!schema.contains(u"const") || schema[u"const"] == value) << terminal_.out;
    EXPECT_TRUE(value.toString().contains(QRegularExpression(schema[u"pattern"].toString())));
    EXPECT_GE(value.toDouble(), schema[u"minimum"].toDouble());
    EXPECT_TRUE(!schema.contains(u"enum") || schema[u"enum"].toArray().contains(value)) << terminal_.out;
    for (const QJsonValue& item : value.toArray()) Check(item, schema[u"items"].toObject());
    const QJsonObject object = value.toObject(), properties = schema[u"properties"].toObject();
    for (const QJsonValue& name : schema[u"required"].toArray())
      EXPECT_TRUE(object.contains(name.toString()));
    for (const QString& name : object.keys()) {
      EXPECT_TRUE(properties.contains(name)) << name.toStdString();
      seen_.insert(name.toStdString());
      Check(object[name], properties[name].toObject());
    }
  }

  QJsonObject schema_;
};

TEST_F(Documents, AreAsTheSchemaHasThem) {
  world_.bench.SetHeldByAnother(3, true, {"another", 4321});
  world_.Attach("", 0x01);
  world_.Attach("late", 0x02);
  world_.Attach("deaf", 0x03);
  world_.Attach("locked", 0x04);
  for (const char* arguments :
       {"ports", "find --port 3", "find 01-04", "preset wide --output wide.json", "preset narrow",
        "show wide.json", "get 01", "get 01,02 --output read", "send wide.json 01-04 --backup before",
        "compare read/unit-01.json 01-04", "compare wide.json before/unit-01.json", "backup all 01-04",
        "restore before 01", "set-id 09 --alone --yes", "send missing.json 01"})
    ExpectDocument(arguments);
  EXPECT_EQ(seen_, described_);
}

}  // namespace
}  // namespace tendril::test
