#include "OutputFile.h"

#include <cerrno>
#include <optional>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "base/PartFile.h"

namespace quorl::tool {

namespace fs = std::filesystem;

namespace {

int writeInPlace(const fs::path& file, std::string_view text) {
  const int opened = open(file.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
  if (opened < 0) return errno;
  int error = writeAll(opened, text) ? 0 : errno;
  if (close(opened) != 0 && error == 0) error = errno;
  return error;
}

/// The file that can be replaced by another, behind all links; none for devices, pipes, and what may not be written.
std::optional<fs::path> replaceable(const fs::path& file) {
  std::error_code error;
  const fs::file_status status = fs::status(file, error);
  if (status.type() == fs::file_type::not_found)
    return fs::is_symlink(fs::symlink_status(file, error)) ? std::nullopt : std::optional(file);
  if (!fs::is_regular_file(status) || access(file.c_str(), W_OK) != 0) return std::nullopt;
  fs::path behindLinks = fs::canonical(file, error);
  return error ? std::nullopt : std::optional(std::move(behindLinks));
}

/// Gives the file that takes the place of another its permissions and owner.
bool takesAfter(int file, const fs::path& other) {
  struct stat mine {
  }, old{};
  if (stat(other.c_str(), &old) != 0) return true;  // there is none
  if (fchmod(file, old.st_mode & 0777U) != 0 || fstat(file, &mine) != 0) return false;
  return (mine.st_uid == old.st_uid && mine.st_gid == old.st_gid) || fchown(file, old.st_uid, old.st_gid) == 0;
}

bool isForbidden(int error) {
  return error == EACCES || error == EPERM || error == EROFS;
}

/// Nothing if there is no right to have a file beside it that then takes its place.
std::optional<int> writeBeside(const fs::path& file, std::string_view text) {
  PartFile part(file);
  if (part.error() != 0) return isForbidden(part.error()) ? std::nullopt : std::optional(part.error());
  const bool isAlike = takesAfter(part.descriptor(), file);
  part.write(text);
  part.close();
  if (part.error() != 0) return part.error();
  if (!isAlike) return std::nullopt;
  part.moveTo(file, /*replacing=*/true);
  const bool isFixed = part.error() == EBUSY || part.error() == EXDEV;  // as where a file system is mounted on it
  return isFixed || isForbidden(part.error()) ? std::nullopt : std::optional(part.error());
}

}  // namespace

tl::expected<void, std::string> writeWholeFile(const fs::path& file, std::string_view text) {
  std::optional<int> error;
  if (const auto target = replaceable(file)) error = writeBeside(*target, text);
  if (!error) error = writeInPlace(file, text);
  if (*error != 0) return tl::unexpected(std::generic_category().message(*error));
  return {};
}

}  // namespace quorl::tool
