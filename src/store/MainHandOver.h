#pragma once

#include <atomic>
#include <chrono>
#include <cstddef>
#include <vector>

#include "base/Queue.h"

namespace quorl::store_detail {

/// Takes the completions of inserts to the main queue, in their order and in batches: to wake a sleeping main thread
/// for each row costs more than all else that surrounds the row's insert.
///
/// A batch leaves when nothing else waits on the database's queue, before anything but an insert runs there, and a
/// millisecond after its first completion at the latest. All but `itemQueued` on the database's queue alone.
class MainHandOver {
 public:
  explicit MainHandOver(Queue& mainQueue) : mainQueue_(mainQueue) {}

  /// A work item has been queued. Any thread.
  void itemQueued() { waiting_.fetch_add(1, std::memory_order_relaxed); }
  /// A work item begins.
  void itemBegins() { waiting_.fetch_sub(1, std::memory_order_relaxed); }
  void add(Queue::Task completion);
  /// A work item that may have added something ends.
  void itemEnds();
  /// Hands over what there is.
  void flush();

 private:
  Queue& mainQueue_;
  std::atomic<std::size_t> waiting_{0};
  std::vector<Queue::Task> batch_;
  std::chrono::steady_clock::time_point begun_;
};

}  // namespace quorl::store_detail
