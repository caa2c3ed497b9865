#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "app/HardwareManager.h"
#include "base/Clock.h"
#include "base/NotificationCenter.h"
#include "base/Queue.h"
#include "platform/Services.h"
#include "platform/TelephonyClient.h"
#include "store/Metric.h"
#include "store/PersistanceStoreProtocol.h"
#include "telephony/CarrierInfoObject.h"

namespace quorl {

/// An abstract face of the service. It offers nothing, and nobody asks for it: the store keeps the class itself.
class HorvaneServiceProtocol {
 public:
  virtual ~HorvaneServiceProtocol() = default;
};

/// The second source of rows: subscriptions, serving cells and bands from the telephony client.
///
/// It writes rows of technology "RAT" through the store, keeps the list of subscriptions, chooses the current one in
/// the shared `HardwareManager` and tells of all this by notifications ("NewHVMetric", "carrierUpdate",
/// "subsIdSelectionChange"). It refuses to retry: an answer that fails is logged or printed, and dropped.
///
/// Main thread. Answers of the client that come on other threads hop to the main queue before they touch anything. The
/// last owner must let go of it on the main thread; answers still on their way then come to nothing.
class HorvaneService final : public HorvaneServiceProtocol,
                             public HorvaneClientDelegate,
                             public std::enable_shared_from_this<HorvaneService> {
  struct Private {};

 public:
  /// Makes a client on the main queue and asks it for the subscriptions at once. Activations of the program are heard
  /// from 5.0 seconds on. `store` must outlive the service and complete a read that found rows on the main queue.
  static std::shared_ptr<HorvaneService> make(PersistanceStoreProtocol& store);

  /// For `make` alone.
  HorvaneService(Private, PersistanceStoreProtocol& store);
  HorvaneService(const HorvaneService&) = delete;
  HorvaneService& operator=(const HorvaneService&) = delete;

 private:
  using MeasurementsContinuation =
      std::function<void(std::optional<HVSignalStrengthMeasurements>, std::optional<HVError>)>;

  void cellMonitorUpdate(const HVServiceSubscriptionContext& context, const HVCellInfo& info) override;
  void connectionStateChanged(const HVServiceSubscriptionContext& context, HVDataConnectionType connection,
                              HVDataConnectionStatus dataConnectionStatusInfo) override;

  void start();
  void observeDidBecomeActive();
  void getSubscriptionInfo();
  void fetchCarrierSubscriptions(const std::optional<HVServiceSubscriptionInfo>& info,
                                 const std::optional<HVError>& error);
  void processCarrierInfo();
  void selectSubscription();
  void select(const CarrierInfoObject* record);

  void copyCellInfo(HVSubscriptionSlot slot);
  void fetchCellInfo(HVSubscriptionSlot slot, HVCellInfo info);
  /// `continuation` runs on the main queue with measurements or with an error, and not at all once the service is gone.
  void fetchSignalMeasurements(HVSubscriptionSlot slot, MeasurementsContinuation continuation);
  void fetchSignalMeasurementsAndMerge(HVSubscriptionSlot slot, HVCellInfo info);
  void mergeCellInfo(const HVCellInfo& info, const HVSignalStrengthMeasurements& measurements, HVSubscriptionSlot slot);

  void fetchBandInfo(HVSubscriptionSlot slot);
  void storeBandRows(const HVBandInfo& bands, std::int32_t subsId);
  void storeBandRows(const char* metricName, const std::optional<HVBandDictionary>& bands, std::int32_t subsId);

  Metric cellInfoDBBuilder(const char* metricTech, const char* metricName, const std::string& attributeName,
                           const HVCellValue& attributeValue, std::int32_t subsId) const;
  void insertTelephonyRow(const Metric& row);
  void refreshCarrierRows(std::size_t index);
  void refreshCarrierRows(std::size_t index, const char* metricName, std::vector<Metric> CarrierInfoObject::*rows);

  // Constant after construction.
  PersistanceStoreProtocol& persistanceStore_;
  Queue& mainQueue_;
  const Clock& clock_;
  Console& console_;
  HorvaneClientFactory& telephony_;
  const std::unique_ptr<HorvaneClient> client_;
  HardwareManager& hManager_;

  // Main thread only.
  std::vector<CarrierInfoObject> carrierInfoArray_;
  bool isSimAdded_ = false;
  NotificationCenter::Observation activation_;
};

}  // namespace quorl
