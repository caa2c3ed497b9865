#include "base/PartFile.h"

#include <cerrno>
#include <cstddef>
#include <cstdio>
#include <cstdlib>

#include <fcntl.h>
#include <unistd.h>

namespace quorl {

bool writeAll(int file, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(file, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) return false;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return true;
}

// Its name does not grow with that of the target, which may be as long as names can be.
PartFile::PartFile(const std::filesystem::path& target) : name_(target.parent_path() / ".quorl-XXXXXX") {
  file_ = ::mkostemp(name_.data(), O_CLOEXEC);
  if (file_ < 0) error_ = errno;
  isBeside_ = file_ >= 0;
}

PartFile::~PartFile() {
  if (file_ >= 0) ::close(file_);
  if (isBeside_) ::unlink(name_.c_str());
}

bool PartFile::write(std::string_view piece) {
  if (!writeAll(file_, piece)) error_ = errno;
  return error_ == 0;
}

void PartFile::flush() {
  if (::fsync(file_) != 0) error_ = errno;
}

void PartFile::close() {
  if (::close(file_) != 0 && error_ == 0) error_ = errno;
  file_ = -1;
}

void PartFile::moveTo(const std::filesystem::path& target, bool replacing) {
  const unsigned flags = replacing ? 0 : RENAME_NOREPLACE;
  if (::renameat2(AT_FDCWD, name_.c_str(), AT_FDCWD, target.c_str(), flags) == 0) {
    isBeside_ = false;
  } else {
    error_ = errno;
  }
}

}  // namespace quorl
