// MessageBoxes: modal message boxes.
#pragma once

#include <string>

namespace tendril {

// Title of boxes that have none of their own.
inline constexpr char kDefaultBoxTitle[] = "Tendril Configuration";

// The icon beside the text.
enum class BoxIcon { kNone, kExclamation, kCritical };

// One message. Texts are plain UTF-8 with CR LF between lines.
struct BoxMessage {
  std::string text;
  std::string title;
  BoxIcon icon = BoxIcon::kNone;

  friend bool operator==(const BoxMessage&, const BoxMessage&) = default;
};

// Both calls run the event loop until the user answers: settle all state before you call. While the program is being
// closed they return at once.
class MessageBoxes {
 public:
  virtual ~MessageBoxes() = default;

  // A box with an OK button.
  virtual void Show(const BoxMessage& message) = 0;
  // A box with Yes and No; true for Yes. Enter, Escape and closing the box give No.
  virtual bool AskYesNo(const BoxMessage& message) = 0;
};

}  // namespace tendril
