#pragma once

#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>

#include <tl/expected.hpp>

#include "hosts/simulator/Recording.h"
#include "hosts/simulator/history/BulkStore.h"
#include "intake/MetricService.h"

namespace quorl::simulator {

/// Writes the rows of metric events into a database in bulk: the product's own intake makes them, so they are the rows
/// that the product would have inserted, in the same order.
///
/// Main thread, on an installed platform whose device decides the family, and before the product is started.
class BulkIntake {
 public:
  /// The error says in one line why the file cannot be used.
  static tl::expected<std::unique_ptr<BulkIntake>, std::string> open(const std::filesystem::path& database) {
    return open(database, database);
  }
  /// For a file that is to be known by another name: errors tell that one.
  static tl::expected<std::unique_ptr<BulkIntake>, std::string> open(const std::filesystem::path& database,
                                                                     const std::filesystem::path& name);

  /// False once something has failed; nothing more is written then.
  bool take(const RecordedEvent& event);
  std::uint64_t events() const { return events_; }
  std::uint64_t rows() const { return store_->rows(); }
  /// Leaves a file that is whole. The error is that of the first failure, with the name of the file.
  tl::expected<void, std::string> finish();

 private:
  BulkIntake(std::filesystem::path name, std::unique_ptr<BulkStore> store);

  const std::filesystem::path name_;
  const std::unique_ptr<BulkStore> store_;
  const std::shared_ptr<MetricService> service_;
  std::uint64_t events_ = 0;
};

}  // namespace quorl::simulator
