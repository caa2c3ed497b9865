#pragma once

#include <filesystem>

namespace quorl::test {

/// A new empty directory, removed with all that is in it when this goes away.
class TemporaryDirectory {
 public:
  TemporaryDirectory() : TemporaryDirectory(std::filesystem::temp_directory_path()) {}
  explicit TemporaryDirectory(const std::filesystem::path& parent);
  ~TemporaryDirectory();
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  const std::filesystem::path& path() const { return path_; }

 private:
  std::filesystem::path path_;
};

}  // namespace quorl::test
