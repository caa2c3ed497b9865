#pragma once

#include "platform/TelephonyClient.h"

namespace quorl::simulator {

/// A telephony client without any SIM: it answers no question and tells of nothing, so that all rows of a store come
/// from the baseband channel.
class SilentTelephony final : public HorvaneClientFactory {
 public:
  std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) override;
  std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() override;
};

}  // namespace quorl::simulator
