// Refusal: why a text or a configuration is not taken.
#pragma once

#include <QString>

namespace tendril {

struct Refusal {
  // "port 3, virtualRange: 5 is not a whole number from 10 to 2550"
  QString Sentence() const { return place.isEmpty() ? reason : place + QStringLiteral(": ") + reason; }

  QString place;  // "port 3, virtualRange" or "line 12"; empty: the text as a whole
  QString reason;
};

}  // namespace tendril
