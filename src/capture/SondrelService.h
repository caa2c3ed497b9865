#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <vector>

#include "base/NotificationCenter.h"
#include "base/RepeatingTimer.h"
#include "capture/SondrelServiceProtocol.h"
#include "platform/SondrelLibrary.h"

namespace quorl {

/// The owner of the capture library: turns its callbacks into calls on the screen, and stops a capture when the
/// process is about to end. It keeps no state of the capture and retries nothing. Main thread.
class SondrelService final : public SondrelDelegate, public std::enable_shared_from_this<SondrelService> {
 public:
  /// Makes the library object, from the installed platform, and becomes its delegate.
  static std::shared_ptr<SondrelService> make();
  SondrelService(const SondrelService&) = delete;
  SondrelService& operator=(const SondrelService&) = delete;

  /// Null on a device that has no such library.
  Sondrel* sondrel() const { return sondrel_.get(); }
  std::shared_ptr<SondrelServiceProtocol> delegate() const { return delegate_.lock(); }
  void setDelegate(std::weak_ptr<SondrelServiceProtocol> delegate) { delegate_ = std::move(delegate); }
  /// Always null; nothing starts one.
  const std::unique_ptr<RepeatingTimer>& timer() const { return timer_; }

  void didStateChanged(std::int64_t state, const std::optional<SondrelError>& errorCode,
                       const std::optional<SondrelConfiguration>& config) override;
  /// Files are delivered whatever the error says. A list with an element that is no file counts as none.
  void didCollectLogs(const std::optional<std::vector<SondrelObject>>& logs,
                      const std::optional<SondrelError>& errorCode) override;
  /// A list with an element that is no text counts as none.
  void configurationListAvailable(const std::optional<std::vector<SondrelObject>>& list) override;

 private:
  SondrelService() = default;
  void initialize();
  void appWillTerminate();
  void presentAlert(const SondrelError& error);

  std::unique_ptr<Sondrel> sondrel_;
  std::weak_ptr<SondrelServiceProtocol> delegate_;
  std::unique_ptr<RepeatingTimer> timer_;
  NotificationCenter::Observation willTerminate_;
};

}  // namespace quorl
