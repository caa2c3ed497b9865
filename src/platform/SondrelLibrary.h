#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <variant>
#include <vector>

#include "base/Clock.h"

// The platform's log-capture library, as far as the product needs it. All of it belongs to the main thread.

namespace quorl {

/// An error of the capture library; `text` is for the user.
struct SondrelError {
  std::string text;
};

/// What a capture is to be like. A property that was never set is none.
class SondrelConfiguration {
 public:
  void setActiveConfig(std::string name) { activeConfig_ = std::move(name); }
  /// In units of 1024 bytes.
  void setChunkFileSize(double size) { chunkFileSize_ = size; }
  void setMaxNumberOfLogs(double count) { maxNumberOfLogs_ = count; }

  const std::optional<std::string>& activeConfig() const { return activeConfig_; }
  std::optional<double> chunkFileSize() const { return chunkFileSize_; }
  std::optional<double> maxNumberOfLogs() const { return maxNumberOfLogs_; }

  friend bool operator==(const SondrelConfiguration&, const SondrelConfiguration&) = default;

 private:
  std::optional<std::string> activeConfig_;
  std::optional<double> chunkFileSize_;
  std::optional<double> maxNumberOfLogs_;
};

/// One collected log file.
struct SondrelFileInformation {
  std::string fileName;
  std::string fileSize;  // formatted by the library
  Date timestamp;

  friend bool operator==(const SondrelFileInformation&, const SondrelFileInformation&) = default;
};

/// An element of a kind that the product does not know.
struct SondrelUnknownObject {};

/// The library's lists do not promise a type of element.
using SondrelObject = std::variant<SondrelFileInformation, std::string, SondrelUnknownObject>;

namespace sondrel_state {
inline constexpr std::int64_t kStopped = 0;
inline constexpr std::int64_t kStarted = 1;
inline constexpr std::int64_t kError = 2;
}  // namespace sondrel_state

/// Hears of a capture, on the main thread.
class SondrelDelegate {
 public:
  virtual ~SondrelDelegate() = default;
  /// `state` is one of `sondrel_state`, or something that is not known yet.
  virtual void didStateChanged(std::int64_t state, const std::optional<SondrelError>& errorCode,
                               const std::optional<SondrelConfiguration>& config) = 0;
  virtual void didCollectLogs(const std::optional<std::vector<SondrelObject>>& logs,
                              const std::optional<SondrelError>& errorCode) = 0;
  virtual void configurationListAvailable(const std::optional<std::vector<SondrelObject>>& list) = 0;
};

/// On-device capture of baseband logs. No operation calls the delegate before it has returned.
class Sondrel {
 public:
  virtual ~Sondrel() = default;
  virtual void setDelegate(std::weak_ptr<SondrelDelegate> delegate) = 0;
  virtual void start(const SondrelConfiguration& configuration) = 0;
  /// May be called when no capture runs.
  virtual void stop() = 0;
  /// Discards the collected logs.
  virtual void reset() = 0;
  /// Leads to `configurationListAvailable`.
  virtual void getConfigurationList() = 0;
};

class SondrelFactory {
 public:
  virtual ~SondrelFactory() = default;
  /// Null when the library cannot be had.
  virtual std::unique_ptr<Sondrel> makeSondrel() = 0;
};

}  // namespace quorl
