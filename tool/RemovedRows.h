#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>

#include "Documents.h"

namespace quorl::tool {

/// Finds out what the product's retention removes, which it does at every start and without a word.
class RemovedRows {
 public:
  /// To be made before the product starts; the directory may be missing.
  explicit RemovedRows(std::filesystem::path documents);
  /// Tells the user of the rows that have gone since, if any.
  void tell() const;

 private:
  const std::filesystem::path documents_;
  const std::optional<StoredRows> before_;
};

}  // namespace quorl::tool
