#pragma once

#include "platform/Services.h"

namespace quorl::desktop {

/// The desktop's clipboard. Main thread.
class QtPasteboard final : public Pasteboard {
 public:
  void setText(std::string_view text) override;
};

}  // namespace quorl::desktop
