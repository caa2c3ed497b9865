#pragma once

#include <filesystem>
#include <memory>
#include <string>

#include <tl/expected.hpp>

#include "hosts/simulator/Descriptor.h"

namespace quorl::simulator {

/// A database that is being made, in a folder of its own beside its later place: nobody finds half of it there. The
/// folder is locked while its maker lives, so that others know what a killed one has left. One thread at a time.
class HistoryDraft {
 public:
  using Outcome = tl::expected<void, std::string>;

  /// Makes the folder. The error says in a few words why that fails.
  static tl::expected<std::unique_ptr<HistoryDraft>, std::string> of(const std::filesystem::path& database);
  /// Removes the drafts of this database whose makers are gone.
  static void removeAbandoned(const std::filesystem::path& database);

  /// Removes what was not moved to its place.
  ~HistoryDraft();
  HistoryDraft(const HistoryDraft&) = delete;
  HistoryDraft& operator=(const HistoryDraft&) = delete;

  /// Where to write meanwhile. There is no file yet.
  std::filesystem::path file() const { return folder_ / database_.filename(); }
  /// Moves the file, which must be whole without its write-ahead log, to its place. A file that has come there
  /// meanwhile stays, which is an error.
  Outcome publish();

 private:
  HistoryDraft(std::filesystem::path database, std::filesystem::path folder, Descriptor lock);

  const std::filesystem::path database_;
  const std::filesystem::path folder_;
  const Descriptor lock_;
};

}  // namespace quorl::simulator
