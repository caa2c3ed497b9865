#pragma once

// How the database's operations run; shared by its writes and its reads.

#include <optional>
#include <utility>

#include "base/FatalStop.h"
#include "platform/Platform.h"
#include "store/DBManager.h"

namespace quorl {

template <typename Work>
void SQLiteDatabase::enqueueWrite(Work work) {
  queue_->async([weak = weak_from_this(), work = std::move(work)]() mutable {
    if (const auto self = weak.lock()) work(*self);
  });
}

template <typename Work>
void SQLiteDatabase::enqueueRead(Work work) {
  queue_->async([weak = weak_from_this(), work = std::move(work)]() mutable {
    const auto self = weak.lock();
    if (!self) fatalStop("self is nil");
    work(*self);
  });
}

namespace store_detail {

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

}  // namespace store_detail
}  // namespace quorl
