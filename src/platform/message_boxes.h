// MessageBoxes: how the program speaks up.
#pragma once

#include <string>

namespace tendril {

// Title of boxes that have none of their own.
inline constexpr char kDefaultBoxTitle[] = "Tendril Configuration";

// The picture beside the text.
enum class BoxIcon { kNone, kExclamation, kCritical };

// One message. Texts are plain UTF-8 with CR LF between lines.
struct BoxMessage {
  std::string text;
  std::string title;
  BoxIcon icon = BoxIcon::kNone;

  friend bool operator==(const BoxMessage&, const BoxMessage&) = default;
};

// Shows modal boxes, one at a time as they come. Both calls run the event loop until the person answers: have
// everything settled before you call. When the program is being closed they return at once.
class MessageBoxes {
 public:
  virtual ~MessageBoxes() = default;

  // A box with an OK button.
  virtual void Show(const BoxMessage& message) = 0;
  // A box with Yes and No; true for Yes. No is what Enter gives; closing it by any other way is a No too.
  virtual bool AskYesNo(const BoxMessage& message) = 0;
};

}  // namespace tendril
