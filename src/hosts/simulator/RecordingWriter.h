#pragma once

#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <string>

#include <tl/expected.hpp>

#include "hosts/simulator/Recording.h"

namespace quorl::simulator {

/// Writes a recording to a file, event by event. After the first failure nothing more is written. One thread at a
/// time.
class RecordingWriter {
 public:
  using Outcome = tl::expected<void, std::string>;

  /// Replaces a file that is there. The error says why the file cannot be written.
  static tl::expected<RecordingWriter, std::string> open(const std::filesystem::path& file);

  void write(const RecordedEvent& event);
  std::uint64_t events() const { return events_; }
  /// Ends the file. The error is that of the first write that failed, if one did.
  Outcome close();

 private:
  struct CloseFile {
    void operator()(std::FILE* file) const { std::fclose(file); }
  };

  explicit RecordingWriter(std::FILE* file) : file_(file) {}

  std::unique_ptr<std::FILE, CloseFile> file_;
  std::uint64_t events_ = 0;
  int error_ = 0;  // errno of the first failure
};

}  // namespace quorl::simulator
