#include "capture/CaptureSlider.h"

#include <algorithm>
#include <cmath>

namespace quorl {

void CaptureSlider::setValue(double value) {
  if (std::isnan(value)) return;
  value_ = std::clamp(value, minimum_, maximum_);
}

}  // namespace quorl
