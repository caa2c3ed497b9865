#include "base/Uuid.h"

#include <algorithm>

#include <boost/uuid/random_generator.hpp>
#include <boost/uuid/uuid.hpp>

namespace quorl {

Uuid Uuid::make() {
  // Seeded by the system once a thread: a system call for each row would cost more than its insert's bookkeeping.
  thread_local boost::uuids::random_generator_mt19937 generator;
  const boost::uuids::uuid value = generator();
  Uuid result;
  std::copy(value.begin(), value.end(), result.bytes.begin());
  return result;
}

std::string Uuid::string() const {
  static constexpr char kDigits[] = "0123456789ABCDEF";
  std::string text;
  text.reserve(36);
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text.push_back('-');
    text.push_back(kDigits[bytes[i] >> 4]);
    text.push_back(kDigits[bytes[i] & 0xF]);
  }
  return text;
}

}  // namespace quorl
