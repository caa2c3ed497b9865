#include "hosts/desktop/LostRows.h"

#include "hosts/desktop/Tell.h"

namespace quorl::desktop {

bool LostRows::isEnabled(std::string_view category, LogLevel level) const {
  return rows_.isEnabled(category, level);
}

void LostRows::write(std::string_view category, LogLevel level, std::string_view text) {
  rows_.write(category, level, text);
  if (rows_.count() > 0) std::call_once(first_, [this] { tell(rows_.report()); });
}

bool LostRows::tellAll() const {
  if (rows_.count() > 1) tell(rows_.report());
  return rows_.count() > 0;
}

}  // namespace quorl::desktop
