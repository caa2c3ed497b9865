#pragma once

#include <memory>
#include <utility>

namespace quorl {

class PersistanceStore;

/// The container of the tabs' screens. Main thread.
class BaseViewController {
 public:
  explicit BaseViewController(std::shared_ptr<PersistanceStore> store) : persistanceStore_(std::move(store)) {}

  const std::shared_ptr<PersistanceStore>& persistanceStore() const { return persistanceStore_; }

 private:
  std::shared_ptr<PersistanceStore> persistanceStore_;
};

}  // namespace quorl
