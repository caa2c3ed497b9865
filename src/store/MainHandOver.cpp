#include "store/MainHandOver.h"

#include <utility>

namespace quorl::store_detail {
namespace {

constexpr std::chrono::milliseconds kLongestWait{1};

}  // namespace

void MainHandOver::add(Queue::Task completion) {
  if (batch_.empty()) begun_ = std::chrono::steady_clock::now();
  batch_.push_back(std::move(completion));
}

void MainHandOver::itemEnds() {
  if (batch_.empty()) return;
  if (waiting_.load(std::memory_order_relaxed) == 0 || std::chrono::steady_clock::now() - begun_ >= kLongestWait)
    flush();
}

void MainHandOver::flush() {
  if (batch_.empty()) return;
  mainQueue_.async([batch = std::exchange(batch_, {})] {
    for (const Queue::Task& completion : batch) completion();
  });
}

}  // namespace quorl::store_detail
