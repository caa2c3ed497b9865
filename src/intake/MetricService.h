#pragma once

#include <memory>

#include "store/PersistanceStoreProtocol.h"

namespace quorl {

class ZelkorWrapper;

/// Decodes each metric that the channel delivers and hands its attributes to the store, on the main thread.
class MetricService {
 public:
  /// Starts listening and becomes the wrapper's delegate. `store` and `zelkor` must outlive the service.
  static std::shared_ptr<MetricService> make(PersistanceStoreProtocol& store, ZelkorWrapper& zelkor);
  virtual ~MetricService() = default;

  ZelkorWrapper& zelkorShared() const { return zelkorShared_; }

 protected:
  MetricService(PersistanceStoreProtocol& store, ZelkorWrapper& zelkor)
      : zelkorShared_(zelkor), persistanceStore_(store) {}

  ZelkorWrapper& zelkorShared_;
  PersistanceStoreProtocol& persistanceStore_;
};

}  // namespace quorl
