#include "screens/export/TextFile.h"

#include <cerrno>
#include <cstdio>
#include <string_view>
#include <system_error>

#include <fcntl.h>
#include <stdlib.h>
#include <unistd.h>

namespace quorl {
namespace {

TextFileError systemError(int code) {
  return {code == EEXIST ? TextFileError::Kind::exists : TextFileError::Kind::notWritten,
          std::generic_category().message(code)};
}

bool writeAll(int file, std::string_view piece) {
  while (!piece.empty()) {
    const ssize_t written = ::write(file, piece.data(), piece.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return false;
    piece.remove_prefix(static_cast<std::size_t>(written));
  }
  return true;
}

/// A file beside its later place, which goes away unless it is moved there.
class PartFile {
 public:
  // Its name does not grow with that of the target, which may be as long as names can be.
  explicit PartFile(const std::filesystem::path& target) : name_(target.parent_path() / ".quorl-XXXXXX") {
    file_ = mkostemp(name_.data(), O_CLOEXEC);
    if (file_ < 0) error_ = errno;
  }
  ~PartFile() {
    if (file_ >= 0) close(file_);
    if (file_ >= 0 && !isMoved_) unlink(name_.c_str());
  }
  PartFile(const PartFile&) = delete;
  PartFile& operator=(const PartFile&) = delete;

  /// 0, or the code of the first error so far.
  int error() const { return error_; }

  bool write(std::string_view piece) {
    if (!writeAll(file_, piece)) error_ = errno;
    return error_ == 0;
  }
  void flush() {
    if (fsync(file_) != 0) error_ = errno;
  }
  void moveTo(const std::filesystem::path& target, Overwrite overwrite) {
    const unsigned flags = overwrite == Overwrite::no ? RENAME_NOREPLACE : 0;
    if (renameat2(AT_FDCWD, name_.c_str(), AT_FDCWD, target.c_str(), flags) == 0) {
      isMoved_ = true;
    } else {
      error_ = errno;
    }
  }

 private:
  std::string name_;
  int file_ = -1;
  int error_ = 0;
  bool isMoved_ = false;
};

}  // namespace

tl::expected<std::uintmax_t, TextFileError> writeTextFile(const std::filesystem::path& path, const SharedText& text,
                                                          Overwrite overwrite) {
  std::error_code ignored;
  const std::filesystem::file_status status = std::filesystem::status(path, ignored);
  if (std::filesystem::is_directory(status)) return tl::unexpected(systemError(EISDIR));
  // Known at once in the usual case; the move at the end holds in any.
  if (overwrite == Overwrite::no && std::filesystem::exists(status)) return tl::unexpected(systemError(EEXIST));

  PartFile part(path);
  std::uintmax_t size = 0;
  if (part.error() == 0) {
    text.write([&](std::string_view piece) {
      size += piece.size();
      return part.write(piece);
    });
  }
  if (part.error() == 0) part.flush();
  if (part.error() == 0) part.moveTo(path, overwrite);
  if (part.error() != 0) return tl::unexpected(systemError(part.error()));
  return size;
}

}  // namespace quorl
