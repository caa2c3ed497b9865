#include "platform/Services.h"

namespace quorl {

std::string SharedText::text() const {
  std::string text;
  write([&text](std::string_view piece) {
    text.append(piece);
    return true;
  });
  return text;
}

}  // namespace quorl
