#include "messages/MessageRef.h"

#include <stdexcept>
#include <string>

namespace quorl {

const AnyMessageRef& AnyMessageArray::elementAtIndex(std::size_t index) const {
  if (index >= count())
    throw std::out_of_range("index " + std::to_string(index) + " beyond bounds of " + std::to_string(count()) +
                            " messages");
  return (*elements_)[index];
}

MetricCodable& AnyMessageArray::addElement(AnyMessageRef element) {
  if (!element) throw std::invalid_argument("a null message cannot be added");
  if (!elements_) elements_.emplace().reserve(4);
  return *elements_->emplace_back(std::move(element)).message();
}

}  // namespace quorl
