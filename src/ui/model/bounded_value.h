// BoundedValue: the value and the limits of a spin button.
#pragma once

#include <algorithm>

namespace tendril {

// A whole number between two limits. A new value is clamped to the limits, a new limit clamps the value, and the other
// limit moves with it where the two would cross.
class BoundedValue {
 public:
  int Value() const { return value_; }
  int Minimum() const { return minimum_; }
  int Maximum() const { return maximum_; }

  void SetValue(int value) { value_ = std::clamp(value, minimum_, maximum_); }
  void SetMinimum(int minimum) { SetLimits(minimum, std::max(minimum, maximum_)); }
  void SetMaximum(int maximum) { SetLimits(std::min(minimum_, maximum), maximum); }
  // `minimum` is at most `maximum`.
  void SetLimits(int minimum, int maximum) {
    minimum_ = minimum;
    maximum_ = maximum;
    SetValue(value_);
  }

 private:
  int value_ = 0;
  int minimum_ = -9999;  // every value that a unit can hold lies between the first limits
  int maximum_ = 9999;
};

}  // namespace tendril
