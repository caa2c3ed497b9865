#include "RemovedRows.h"

#include <limits>
#include <utility>

#include <fmt/format.h>

#include "Commands.h"

namespace quorl::tool {

RemovedRows::RemovedRows(std::filesystem::path documents)
    : documents_(std::move(documents)), before_(storedRows(documents_, std::numeric_limits<std::int64_t>::max())) {}

void RemovedRows::tell() const {
  if (!before_) return;
  const auto left = storedRows(documents_, before_->lastId);
  if (!left || left->count >= before_->count) return;
  const std::int64_t removed = before_->count - left->count;
  complain(fmt::format("{} row{} of thirty days ago and older {} removed", removed, removed == 1 ? "" : "s",
                       removed == 1 ? "was" : "were"));
}

}  // namespace quorl::tool
