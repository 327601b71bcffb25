// BoundedValue: what a spin button holds.
#pragma once

#include <algorithm>

namespace tendril {

// A whole number between two limits. A new value is brought within the limits, a new limit brings the value
// within it, and the other limit gives way where the two would cross.
class BoundedValue {
 public:
  // Every value that a record can give fits between these.
  static constexpr int kWidest = 9999;

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
  // Takes the widest limits, and 0.
  void Reset() { *this = BoundedValue(); }

 private:
  int value_ = 0;
  int minimum_ = -kWidest;
  int maximum_ = kWidest;
};

}  // namespace tendril
