#include "ProgressBar.h"

#include <algorithm>
#include <cmath>
#include <cstdio>

#include <fmt/format.h>
#include <unistd.h>

namespace quorl::tool {
namespace {

constexpr int kWidth = 30;
constexpr std::chrono::milliseconds kInterval{100};

void print(const std::string& text) {
  std::fwrite(text.data(), 1, text.size(), stderr);
  std::fflush(stderr);
}

}  // namespace

std::string progressText(double share, std::string_view words) {
  const double known = std::isfinite(share) ? std::clamp(share, 0.0, 1.0) : 0.0;
  const auto done = static_cast<std::size_t>(known * kWidth);
  std::string bar(done, '=');
  if (done < kWidth) bar.push_back('>');
  bar.resize(kWidth, ' ');
  return fmt::format("[{}] {:3.0f} % {}", bar, std::floor(known * 100), words);
}

ProgressBar::ProgressBar() : isShown_(isatty(STDERR_FILENO) == 1) {}

ProgressBar::~ProgressBar() {
  if (isShown_) print("\r\x1b[K");
}

void ProgressBar::show(double share, std::string_view words) {
  if (!isShown_) return;
  const auto now = std::chrono::steady_clock::now();
  if (now - last_ < kInterval) return;
  last_ = now;
  print("\r\x1b[K" + progressText(share, words));
}

}  // namespace quorl::tool
