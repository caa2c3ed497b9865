#include "hosts/simulator/UsableDocuments.h"

#include <cerrno>
#include <cstdlib>
#include <memory>
#include <string_view>
#include <system_error>

#include <fmt/format.h>
#include <sqlite3.h>
#include <unistd.h>

#include "hosts/simulator/Descriptor.h"
#include "hosts/simulator/PhoneServices.h"

namespace quorl::simulator {

namespace fs = std::filesystem;

namespace {

constexpr char kDatabaseName[] = "metricPartV11.sqlite";
constexpr int kLongestLockMs = 5000;

tl::unexpected<std::string> unusable(const fs::path& path, std::string_view why) {
  return tl::unexpected(fmt::format("{}: {}", path.string(), why));
}

/// Permissions alone do not tell whether a file can be made.
tl::expected<void, std::string> tryWriting(const fs::path& directory) {
  std::string probe = (directory / ".quorl-XXXXXX").string();
  const Descriptor file(::mkstemp(probe.data()));
  if (!file.isOpen()) return unusable(directory, std::generic_category().message(errno));
  ::unlink(probe.c_str());
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

}  // namespace

tl::expected<void, std::string> prepareDocuments(const fs::path& documents) {
  if (!FixedDocumentsDirectory(documents).path()) return unusable(documents, std::generic_category().message(errno));
  if (auto written = tryWriting(documents); !written) return written;
  const fs::path file = documents / kDatabaseName;
  std::error_code ignored;
  return fs::exists(file, ignored) ? tryReading(file) : tl::expected<void, std::string>();
}

}  // namespace quorl::simulator
