#pragma once

#include <chrono>
#include <string>
#include <string_view>

namespace quorl::tool {

/// A line on standard error that shows how far something long has come, and goes away when it ends. Only on a
/// terminal: anywhere else it shows nothing.
class ProgressBar {
 public:
  ProgressBar();
  ~ProgressBar();
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;

  /// `share` from 0 to 1, and a few words behind the bar. Shown some times a second at most.
  void show(double share, std::string_view words);

 private:
  const bool isShown_;
  std::chrono::steady_clock::time_point last_;
};

/// The bar as text, such as "[=====>    ]  50 % 1200 rows".
std::string progressText(double share, std::string_view words);

}  // namespace quorl::tool
