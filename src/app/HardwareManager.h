#pragma once

#include <atomic>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "base/NotificationCenter.h"
#include "telephony/CarrierInfoObject.h"

namespace quorl {

/// Why the device cannot be used.
enum class HardwareError { unableToGetBasebandInfo };

class HardwareException : public std::runtime_error {
 public:
  explicit HardwareException(HardwareError error);
  HardwareError error() const { return error_; }

 private:
  HardwareError error_;
};

/// What kind of device and build the product runs on, answered once at start, and the selection state that all screens
/// share. Nothing of it is persisted.
class HardwareManager {
 public:
  /// The process-wide instance, made from the installed platform on first use; safe against concurrent first use.
  static HardwareManager& shared();
  /// Forgets the instance; for tests, between cases.
  static void resetShared();

  HardwareManager();
  HardwareManager(const HardwareManager&) = delete;
  HardwareManager& operator=(const HardwareManager&) = delete;

  // Constant after construction; any thread.
  bool isInternalBuild() const { return isInternalBuild_; }
  bool isCarrierBuild() const { return isCarrierBuild_; }
  bool isInternalOrCarrierBuild() const { return isInternalOrCarrierBuild_; }
  bool isMavDevice() const { return isMavDevice_; }
  bool isIceDevice() const { return isIceDevice_; }
  /// Whether log capture is possible.
  bool isSondrelCompatible() const { return isSondrelCompatible_; }
  /// "Tabrin" or "Quillo".
  const std::string& deviceClass() const { return deviceClass_; }
  /// "unknown" when the device does not say.
  const std::string& basebandChipset() const { return basebandChipset_; }
  /// Base name of the configuration resource.
  const std::string& deviceConfigFileName() const { return deviceConfigFileName_; }
  /// `triggerID` of every metric query.
  std::int32_t metricTriggerID() const { return metricTriggerID_; }

  // Main thread only.
  const std::string& tabSelectedTitle() const { return tabSelectedTitle_; }
  void setTabSelectedTitle(std::string title) { tabSelectedTitle_ = std::move(title); }
  const std::vector<CarrierInfoObject>& carriers() const { return carriers_; }

  /// The subscription that all screens show. Written on the main thread, read on the database's queue as well.
  std::int32_t currentSubsId() const { return currentSubsId_.load(std::memory_order_relaxed); }
  void setCurrentSubsId(std::int32_t subsId) { currentSubsId_.store(subsId, std::memory_order_relaxed); }

  /// Throws `HardwareException` with `unableToGetBasebandInfo` if the chipset is unknown.
  void validateBaseband() const;
  /// Observer of "carrierUpdate": takes over the entry "carriers", if it is there.
  void processCarriers(const Notification& notification);

 private:
  bool isInternalBuild_;
  bool isCarrierBuild_;
  bool isInternalOrCarrierBuild_;
  bool isMavDevice_;
  bool isIceDevice_;
  bool isSondrelCompatible_;
  std::string deviceClass_;
  std::string basebandChipset_;
  std::string deviceConfigFileName_;
  std::int32_t metricTriggerID_;

  std::string tabSelectedTitle_;
  std::vector<CarrierInfoObject> carriers_;
  std::atomic<std::int32_t> currentSubsId_{0};

  NotificationCenter::Observation carrierObservation_;
};

}  // namespace quorl
