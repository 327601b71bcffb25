// JSON read to the letter: Qt's parser is more generous.
#pragma once

#include <QByteArray>
#include <QJsonDocument>
#include <QJsonValue>

#include "exchange/refusal.h"

namespace tendril::exchange {

// Parses `text`. Throws a Refusal that names the line. Refuses also what Qt's parser lets pass: a name that stands twice
// in an object, control characters in a string, unknown escapes, and numbers that begin or end with their point. Qt
// allows 1024 levels of nesting.
QJsonDocument ParseStrictly(const QByteArray& text);

// A value, or a string as a JSON string: in one line, ASCII control characters escaped.
QByteArray JsonText(const QJsonValue& value);

// The beginning of that, for a sentence.
QString Quoted(const QJsonValue& value);

}  // namespace tendril::exchange
