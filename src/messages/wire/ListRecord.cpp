#include "messages/wire/ListRecord.h"

#include <stdexcept>

#include <fmt/format.h>

namespace quorl {

void throwListRangeError(std::size_t index, std::uint64_t count) {
  throw std::out_of_range(fmt::format("idx ({}) is out of range ({})", index, count));
}

}  // namespace quorl
