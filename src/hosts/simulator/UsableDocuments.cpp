#include "hosts/simulator/UsableDocuments.h"

#include <cerrno>
#include <fstream>
#include <memory>
#include <string_view>
#include <system_error>

#include <fmt/format.h>
#include <sqlite3.h>

#include "base/PartFile.h"
#include "hosts/simulator/PhoneServices.h"

namespace quorl::simulator {

namespace fs = std::filesystem;

namespace {

constexpr int kLongestLockMs = 5000;

tl::unexpected<std::string> unusable(const fs::path& path, std::string_view why) {
  return tl::unexpected(fmt::format("{}: {}", path.string(), why));
}

/// Permissions alone do not tell whether a file can be made.
tl::expected<void, std::string> tryWriting(const fs::path& directory) {
  const PartFile probe(databaseFile(directory));
  if (probe.error() != 0) return unusable(directory, std::generic_category().message(probe.error()));
  return {};
}

tl::expected<void, std::string> tryReading(const fs::path& file) {
  sqlite3* opened = nullptr;
  int code = sqlite3_open_v2(file.c_str(), &opened, SQLITE_OPEN_READWRITE, nullptr);
  const std::unique_ptr<sqlite3, int (*)(sqlite3*)> database(opened, sqlite3_close);
  if (code == SQLITE_OK) {
    sqlite3_busy_timeout(opened, kLongestLockMs);
    code = sqlite3_exec(opened, "SELECT count(*) FROM sqlite_master", nullptr, nullptr, nullptr);
  }
  if (code != SQLITE_OK) return unusable(file, sqlite3_errmsg(opened));
  return {};
}

/// Whether both are one file, or would be once they are there.
bool isSameFile(const fs::path& one, const fs::path& other) {
  std::error_code error;
  if (fs::equivalent(one, other, error)) return true;
  // Of a relative path whose file is missing, the canonical one would be relative as well.
  const auto whole = [&error](const fs::path& path) { return fs::weakly_canonical(fs::absolute(path, error), error); };
  return !one.empty() && whole(one) == whole(other) && !error;
}

/// Whether a file that is there begins as a database, or the log or journal of one, does.
bool looksLikeDatabase(const fs::path& file) {
  constexpr std::string_view kDatabase{"SQLite format 3\0", 16};
  constexpr std::string_view kLog{"\x37\x7f\x06", 3};
  constexpr std::string_view kJournal{"\xd9\xd5\x05\xf9\x20\xa1\x63\xd7", 8};
  std::error_code ignored;
  if (!fs::is_regular_file(file, ignored)) return false;
  std::string begin(kDatabase.size(), ' ');
  std::ifstream(file, std::ios::binary).read(begin.data(), static_cast<std::streamsize>(begin.size()));
  return begin == kDatabase || begin.starts_with(kLog) || begin.starts_with(kJournal);
}

}  // namespace

fs::path databaseFile(const fs::path& documents) {
  return documents / "metricPartV11.sqlite";
}

tl::expected<void, std::string> prepareDocuments(const fs::path& documents) {
  if (!FixedDocumentsDirectory(documents).path()) return unusable(documents, std::generic_category().message(errno));
  if (auto written = tryWriting(documents); !written) return written;
  const fs::path file = databaseFile(documents);
  std::error_code error;
  if (fs::exists(file, error)) return tryReading(file);
  return error ? unusable(file, error.message()) : tl::expected<void, std::string>();
}

tl::expected<void, std::string> spareDatabase(const fs::path& target, const fs::path& documents) {
  bool isPart = looksLikeDatabase(target);
  if (!documents.empty())
    for (const char* ending : {"", "-wal", "-shm", "-journal"})
      isPart = isPart || isSameFile(target, databaseFile(documents).concat(ending));
  if (isPart) return unusable(target, "belongs to a database and is not overwritten");
  return {};
}

}  // namespace quorl::simulator
