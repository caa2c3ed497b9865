#pragma once

#include <csignal>
#include <stdexcept>

#include <sys/resource.h>

namespace quorl::test {

/// While it lives, no file that this process writes grows beyond `bytes`: writes fail with EFBIG, as they would with
/// ENOSPC on a full disk.
class FileSizeLimit {
 public:
  explicit FileSizeLimit(rlim_t bytes) : previousHandler_(std::signal(SIGXFSZ, SIG_IGN)) {
    if (getrlimit(RLIMIT_FSIZE, &previous_) != 0) throw std::runtime_error("cannot read the limit of file sizes");
    rlimit limit = previous_;
    limit.rlim_cur = bytes;
    if (setrlimit(RLIMIT_FSIZE, &limit) != 0) throw std::runtime_error("cannot limit file sizes");
  }
  ~FileSizeLimit() {
    setrlimit(RLIMIT_FSIZE, &previous_);
    std::signal(SIGXFSZ, previousHandler_);
  }
  FileSizeLimit(const FileSizeLimit&) = delete;
  FileSizeLimit& operator=(const FileSizeLimit&) = delete;

 private:
  using Handler = void (*)(int);

  const Handler previousHandler_;
  rlimit previous_{};
};

}  // namespace quorl::test
