// JSON read to the letter: Qt's parser is more generous.
#pragma once

#include <QByteArray>
#include <QJsonDocument>
#include <QJsonValue>

#include "exchange/refusal.h"

namespace tendril::exchange {

// Parses `text`. Throws a Refusal that names the line. Refuses also what Qt's parser lets pass: a name that stands twice
// in an object, control characters in a string, unknown escapes, numbers that begin or end with their point, and those
// that have more than 15 digits. Qt allows 1024 levels of nesting.
QJsonDocument ParseStrictly(const QByteArray& text);

// A value, or a string as a JSON string: in one line, ASCII control characters escaped.
QByteArray JsonText(const QJsonValue& value);

// The same for a sentence: cut where it is long.
QString Quoted(const QJsonValue& value);

}  // namespace tendril::exchange
