#pragma once

// How the database's operations run; shared by its writes and its reads.

#include <memory>
#include <optional>
#include <utility>

#include "base/FatalStop.h"
#include "platform/Platform.h"
#include "store/MainHandOver.h"
#include "store/SQLiteError.h"

namespace quorl::store_detail {

/// Queues `work`, which is called with the database. With the database gone it is not called.
template <typename Database, typename Work>
void enqueueWrite(Database& database, Work work) {
  database.handOver()->itemQueued();
  database.queue().async(
      [weak = database.weak_from_this(), handOver = database.handOver(), work = std::move(work)]() mutable {
        handOver->itemBegins();
        handOver->flush();
        if (const auto self = weak.lock()) work(*self);
      });
}

/// As `enqueueWrite`, for a `work` that leaves its completion to the hand-over, its second argument.
template <typename Database, typename Work>
void enqueueInsert(Database& database, Work work) {
  database.handOver()->itemQueued();
  database.queue().async(
      [weak = database.weak_from_this(), handOver = database.handOver(), work = std::move(work)]() mutable {
        handOver->itemBegins();
        if (const auto self = weak.lock()) work(*self, *handOver);
        handOver->itemEnds();
      });
}

/// As `enqueueWrite`, but a database that is gone ends the process.
template <typename Database, typename Work>
void enqueueRead(Database& database, Work work) {
  database.handOver()->itemQueued();
  database.queue().async(
      [weak = database.weak_from_this(), handOver = database.handOver(), work = std::move(work)]() mutable {
        handOver->itemBegins();
        handOver->flush();
        const auto self = weak.lock();
        if (!self) fatalStop("self is nil");
        work(*self);
      });
}

inline void onMain(Queue::Task task) {
  Platform::current().mainQueue.async(std::move(task));
}

template <typename Completion>
void failOnMain(Completion completion, SQLiteError error) {
  onMain([completion = std::move(completion), error = std::move(error)]() mutable {
    completion({}, std::optional(std::move(error)));
  });
}

template <typename Completion, typename Result>
void succeedOnMain(Completion completion, Result result) {
  onMain([completion = std::move(completion), result = std::move(result)]() mutable {
    completion(std::move(result), std::nullopt);
  });
}

}  // namespace quorl::store_detail
