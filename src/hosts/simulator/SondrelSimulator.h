#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <limits>
#include <memory>
#include <string>
#include <vector>

#include "base/Clock.h"
#include "base/Queue.h"
#include "hosts/simulator/BasebandLog.h"
#include "platform/SondrelLibrary.h"

namespace quorl::simulator {

/// A log-capture library that exists only in software. While a capture runs it writes one chunk file at a time into a
/// folder and reports the files in batches. The folder is a ring: beyond the capture's highest number of files the
/// oldest goes, files of earlier runs included. A chunk has its full size, begins with what the baseband did since the
/// one before, and takes no room on the disk for the rest.
///
/// - A start while a capture runs goes on with the new settings. What waits for its batch is reported first.
/// - A stop reports what waits for its batch, then the state. Without a capture it says nothing.
/// - A reset removes all chunk files of the folder; a running capture goes on.
/// - A configuration that is not in the list, a size or number that makes no sense, and a folder that cannot be
///   written are answered with the state 2. A chunk that cannot be written is reported in place of files, and ends the
///   capture.
///
/// Operations belong to the main thread. Files are written on a queue of the simulator's own, callbacks come on the
/// main queue, always after the call has returned.
class SondrelSimulator final : public SondrelFactory {
 public:
  struct Options {
    std::filesystem::path folder;
    std::chrono::milliseconds chunkInterval{500};
    std::size_t chunksPerBatch = 4;
    std::uint64_t capacity = std::numeric_limits<std::uint64_t>::max();  // bytes until the disk counts as full
    std::vector<std::string> configurations = defaultConfigurations();
    /// What is captured; null: nothing but the heads of chunks.
    std::shared_ptr<BasebandLog> log{};
  };

  static std::vector<std::string> defaultConfigurations();
  /// Where a simulated phone keeps its chunks, and whose doings are in them.
  static Options ofPhone(const std::filesystem::path& documents, std::shared_ptr<BasebandLog> log);

  /// The main queue and the clock must outlive it and what it makes.
  SondrelSimulator(Options options, Queue& mainQueue, QueueFactory& queues, const Clock& clock);
  ~SondrelSimulator() override;

  std::unique_ptr<Sondrel> makeSondrel() override;

 private:
  class Capture;
  class Library;

  const Options options_;
  Queue& mainQueue_;
  const Clock& clock_;
  const std::shared_ptr<Queue> worker_;
};

}  // namespace quorl::simulator
