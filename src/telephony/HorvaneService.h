#pragma once

#include <memory>

#include "store/PersistanceStoreProtocol.h"

namespace quorl {

/// The second source of rows: subscriptions, serving cells and bands from the telephony client. Main thread.
class HorvaneService {
 public:
  /// Starts asking the platform's telephony client. `store` must outlive the service.
  static std::shared_ptr<HorvaneService> make(PersistanceStoreProtocol& store);
  virtual ~HorvaneService() = default;
};

}  // namespace quorl
