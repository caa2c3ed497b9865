#include "hosts/simulator/history/HistoryDraft.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <string_view>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace quorl::simulator {

namespace fs = std::filesystem;

namespace {

constexpr std::string_view kDraftName = ".quorl-history-";
constexpr int kMostFolders = 10;
/// What SQLite puts beside a database.
constexpr std::array kCompanions{"-wal", "-shm", "-journal"};

fs::path withEnding(const fs::path& database, const char* ending) {
  fs::path companion = database;
  companion += ending;
  return companion;
}

void removeCompanions(const fs::path& database) {
  for (const char* ending : kCompanions) ::unlink(withEnding(database, ending).c_str());
}

/// Nothing but what a draft can hold: the folder may be somebody else's after all.
void removeDraft(const fs::path& folder, const fs::path& name) {
  removeCompanions(folder / name);
  ::unlink((folder / name).c_str());
  ::rmdir(folder.c_str());
}

Descriptor openFolder(const fs::path& folder) {
  return Descriptor(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
}

fs::path folderOf(const fs::path& database) {
  return database.has_parent_path() ? database.parent_path() : fs::path(".");
}

int moveWithoutReplacing(const fs::path& from, const fs::path& to) {
  if (::renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0) return 0;
  // Not every file system knows how.
  if (errno != EINVAL && errno != ENOSYS) return errno;
  if (::link(from.c_str(), to.c_str()) == 0) return 0;
  if (errno != EPERM && errno != EOPNOTSUPP && errno != ENOSYS) return errno;
  std::error_code error;
  if (fs::exists(to, error)) return EEXIST;
  fs::rename(from, to, error);
  return error.value();
}

}  // namespace

HistoryDraft::HistoryDraft(fs::path database, fs::path folder, Descriptor lock)
    : database_(std::move(database)), folder_(std::move(folder)), lock_(std::move(lock)) {}

HistoryDraft::~HistoryDraft() {
  removeDraft(folder_, database_.filename());
}

tl::expected<std::unique_ptr<HistoryDraft>, std::string> HistoryDraft::of(const fs::path& database) {
  for (int made = 0; made < kMostFolders; ++made) {
    std::string folder = (folderOf(database) / kDraftName).string() + "XXXXXX";
    if (::mkdtemp(folder.data()) == nullptr) break;
    Descriptor lock = openFolder(folder);
    // Until it is locked, another program may take it for abandoned. A file system without locks has to do.
    if (!lock.isOpen() || (::flock(lock.number(), LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK)) continue;
    std::error_code ignored;
    if (fs::exists(folder, ignored))
      return std::unique_ptr<HistoryDraft>(new HistoryDraft(database, std::move(folder), std::move(lock)));
  }
  return tl::unexpected(std::generic_category().message(errno));
}

void HistoryDraft::removeAbandoned(const fs::path& database) {
  std::error_code error;
  for (const fs::directory_entry& entry : fs::directory_iterator(folderOf(database), error)) {
    if (!entry.path().filename().string().starts_with(kDraftName)) continue;
    const Descriptor lock = openFolder(entry.path());
    if (lock.isOpen() && ::flock(lock.number(), LOCK_EX | LOCK_NB) == 0) removeDraft(entry.path(), database.filename());
  }
}

HistoryDraft::Outcome HistoryDraft::publish() {
  std::error_code ignored;
  // What a removed database has left would be taken for this one's.
  if (!fs::exists(database_, ignored)) removeCompanions(database_);
  const int error = moveWithoutReplacing(file(), database_);
  if (error == EEXIST) return tl::unexpected(std::string("another program has made it meanwhile"));
  if (error != 0) return tl::unexpected(std::generic_category().message(error));
  return {};
}

}  // namespace quorl::simulator
