#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include <tl/expected.hpp>

// What the tool itself does with the database file that the store leaves in a documents directory.

namespace quorl::tool {

/// Rows of metrics.
struct StoredRows {
  std::int64_t count = 0;
  std::int64_t lastId = 0;  // 0 if there is none
};

/// The rows with an id of `lastId` at most. Nothing if they cannot be counted, as when there is no database.
std::optional<StoredRows> storedRows(const std::filesystem::path& documents, std::int64_t lastId);

/// Writes everything that is still in the write-ahead log into the database file, so that the file alone is whole.
tl::expected<void, std::string> foldWriteAheadLog(const std::filesystem::path& documents);

/// The baseband family whose metrics a database holds, "mav" or "ice", as the metric ids tell; "mav" if they do not.
tl::expected<std::string, std::string> basebandFamily(const std::filesystem::path& documents);

/// What a store holds of one metric.
struct MetricSummary {
  std::string tech;
  std::string name;
  std::int64_t rows = 0;
  std::string lastSeen;  // wall-clock time, as stored
};

/// By technology, then by metric.
tl::expected<std::vector<MetricSummary>, std::string> summarize(const std::filesystem::path& documents);

}  // namespace quorl::tool
