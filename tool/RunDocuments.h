#pragma once

#include <filesystem>
#include <memory>
#include <mutex>
#include <string>

#include <tl/expected.hpp>

namespace quorl::tool {

/// The documents directory of one run. One that the user has not named is removed again, also when an
/// interrupt, a request to terminate or a hang-up ends the process.
class RunDocuments {
 public:
  /// `named`: empty for a directory that goes with the run. The error says in one line why there is no place for one.
  /// To be called before any other thread starts.
  static tl::expected<std::unique_ptr<RunDocuments>, std::string> make(const std::string& named);
  ~RunDocuments();
  RunDocuments(const RunDocuments&) = delete;
  RunDocuments& operator=(const RunDocuments&) = delete;

  /// Until this is called, a signal waits: files are about to be made, which would be left behind.
  void settled();

  const std::filesystem::path& path() const { return path_; }
  bool isNamed() const { return isNamed_; }

 private:
  RunDocuments(std::filesystem::path path, bool isNamed);

  const std::filesystem::path path_;
  const bool isNamed_;
  const std::shared_ptr<std::mutex> inUse_;
  std::unique_lock<std::mutex> using_;
};

}  // namespace quorl::tool
