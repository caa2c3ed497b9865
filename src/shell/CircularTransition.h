#pragma once

#include <string>
#include <utility>

namespace quorl {

enum class CircularTransitionMode { present, dismiss, pop };

/// A circle that grows out of a point as a screen comes, and shrinks back into it as the screen goes. Main thread.
class CircularTransition {
 public:
  struct Point {
    double x = 0;
    double y = 0;
    friend bool operator==(const Point&, const Point&) = default;
  };
  struct Size {
    double width = 0;
    double height = 0;
  };

  /// Scale of the circle and of the moving view at the circle's smallest.
  static constexpr double kSmallestScale = 0.001;

  /// In the container's coordinates.
  Point startingPoint() const { return startingPoint_; }
  void setStartingPoint(Point point) { startingPoint_ = point; }
  /// Name of a colour.
  const std::string& circleColor() const { return circleColor_; }
  void setCircleColor(std::string name) { circleColor_ = std::move(name); }
  double durationS() const { return durationS_; }
  void setDurationS(double duration) { durationS_ = duration; }
  CircularTransitionMode transitionMode() const { return transitionMode_; }
  void setTransitionMode(CircularTransitionMode mode) { transitionMode_ = mode; }

  /// Of the full-grown circle around `startingPoint`, so that it covers the farthest corner of `container`.
  double diameter(Size container) const;

 private:
  Point startingPoint_;
  std::string circleColor_ = "white";
  double durationS_ = 0.3;
  CircularTransitionMode transitionMode_ = CircularTransitionMode::present;
};

}  // namespace quorl
