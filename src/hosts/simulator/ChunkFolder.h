#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <utility>

#include <tl/expected.hpp>

#include "platform/SondrelLibrary.h"

namespace quorl::simulator {

/// The chunk files of simulated captures in one folder, oldest first. A chunk has the size that was asked for: lines of
/// text, and a hole behind them that takes no room on the disk. One thread.
class ChunkFolder {
 public:
  /// `capacity`: bytes that all chunks together may have before the disk counts as full.
  ChunkFolder(std::filesystem::path folder, std::uint64_t capacity) : folder_(std::move(folder)), capacity_(capacity) {}

  /// Makes the folder (0700) if it alone is missing, and takes over the chunks that lie there from an earlier run. What
  /// else lies there is left alone.
  tl::expected<void, SondrelError> open();
  /// Answers what is to be in a chunk behind its head, so many bytes at most.
  using Content = std::function<std::string(std::size_t bytes)>;
  /// Writes the next chunk, readable for its owner alone. One that fails leaves nothing behind.
  tl::expected<SondrelFileInformation, SondrelError> write(const std::string& configuration, std::uint64_t bytes,
                                                           Date date, const Content& content);
  /// Removes the oldest chunks until `count` are left.
  void keepAtMost(std::size_t count);

  std::size_t size() const { return chunks_.size(); }

 private:
  struct Chunk {
    std::uint64_t number;
    std::filesystem::path path;
    std::uint64_t bytes;
  };

  const std::filesystem::path folder_;
  const std::uint64_t capacity_;
  std::deque<Chunk> chunks_;
  std::uint64_t usedBytes_ = 0;
  std::uint64_t lastNumber_ = 0;
};

}  // namespace quorl::simulator
