#pragma once

namespace quorl {

/// A slider of the capture screen: a value within its limits. Main thread.
class CaptureSlider {
 public:
  /// Starts at its minimum.
  CaptureSlider(double minimum, double maximum) : minimum_(minimum), maximum_(maximum), value_(minimum) {}

  double minimum() const { return minimum_; }
  double maximum() const { return maximum_; }
  double value() const { return value_; }
  /// A value beyond a limit becomes the limit; one that is no number changes nothing.
  void setValue(double value);

 private:
  const double minimum_;
  const double maximum_;
  double value_;
};

}  // namespace quorl
