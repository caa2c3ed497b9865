#include "hosts/simulator/history/BulkIntake.h"

#include <utility>

#include "intake/ZelkorWrapper.h"

namespace quorl::simulator {

tl::expected<std::unique_ptr<BulkIntake>, std::string> BulkIntake::open(const std::filesystem::path& database,
                                                                        const std::filesystem::path& name) {
  auto store = BulkStore::open(database);
  if (!store) return tl::unexpected(name.string() + ": " + store.error());
  return std::unique_ptr<BulkIntake>(new BulkIntake(name, *std::move(store)));
}

BulkIntake::BulkIntake(std::filesystem::path name, std::unique_ptr<BulkStore> store)
    : name_(std::move(name)),
      store_(std::move(store)),
      service_(MetricService::make(*store_, ZelkorWrapper::sharedInstance())) {}

bool BulkIntake::take(const RecordedEvent& event) {
  if (store_->hasFailed()) return false;
  service_->processMetric(event.message());
  ++events_;
  return !store_->hasFailed();
}

tl::expected<void, std::string> BulkIntake::finish() {
  if (auto outcome = store_->finish(); !outcome) return tl::unexpected(name_.string() + ": " + outcome.error());
  return {};
}

}  // namespace quorl::simulator
