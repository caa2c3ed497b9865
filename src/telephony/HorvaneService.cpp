#include "telephony/HorvaneService.h"

#include <algorithm>
#include <chrono>
#include <limits>
#include <utility>

#include <fmt/format.h>

#include "base/FatalStop.h"
#include "intake/MetricGroupV2.h"
#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"
#include "telephony/CellDictionary.h"
#include "telephony/TelephonyLogText.h"

namespace quorl {
namespace {

constexpr char kTech[] = "RAT";
constexpr char kCellInfo[] = "Cell Info";
constexpr char kActiveBands[] = "Active Bands";
constexpr char kSupportedBands[] = "Supported Bands";

// The first activation belongs to the start itself, which asks for the subscriptions anyway.
constexpr std::chrono::seconds kActivationDelay{5};

CarrierInfoObject makeRecord(const HVServiceSubscriptionContext& context) {
  CarrierInfoObject record;
  record.simSlot = context.slotID();
  record.isSimPresent = context.isSimPresent();
  record.simSlotKey = simSlotKeyForSlot(context.slotID());
  return record;
}

/// Unlike `logText` of an optional error, without "Optional(...)" around it.
std::string bareText(const std::optional<SQLiteError>& error) {
  return error ? logText(*error) : "nil";
}

}  // namespace

std::shared_ptr<HorvaneService> HorvaneService::make(PersistanceStoreProtocol& store) {
  auto service = std::make_shared<HorvaneService>(Private{}, store);
  service->start();
  return service;
}

HorvaneService::HorvaneService(Private, PersistanceStoreProtocol& store)
    : persistanceStore_(store),
      mainQueue_(Platform::current().mainQueue),
      clock_(Platform::current().clock),
      console_(Platform::current().console),
      telephony_(Platform::current().telephony),
      client_(telephony_.initWithQueue(mainQueue_)),
      hManager_(HardwareManager::shared()) {}

void HorvaneService::start() {
  client_->setDelegate(weak_from_this());
  horvaneServiceLog.log("HorvaneService - init");
  mainQueue_.asyncAfter(kActivationDelay, [weak = weak_from_this()] {
    if (const auto self = weak.lock()) self->observeDidBecomeActive();
  });
  getSubscriptionInfo();
}

void HorvaneService::observeDidBecomeActive() {
  activation_ = NotificationCenter::defaultCenter().observe(
      notification::kDidBecomeActive, [weak = weak_from_this()](const Notification&) {
        const auto self = weak.lock();
        if (!self) return;
        horvaneServiceLog.log("HorvaneService - didBecomeActiveNotification");
        self->carrierInfoArray_.clear();
        self->getSubscriptionInfo();
      });
}

void HorvaneService::getSubscriptionInfo() {
  client_->getSubscriptionInfo([weak = weak_from_this()](const auto& info, const auto& error) {
    if (const auto self = weak.lock()) self->fetchCarrierSubscriptions(info, error);
  });
}

void HorvaneService::fetchCarrierSubscriptions(const std::optional<HVServiceSubscriptionInfo>& info,
                                               const std::optional<HVError>& error) {
  if (error) {
    horvaneServiceLog.log("HorvaneService - fetchCarrierSubscriptions error: %{public}s ", error->text);
    return;
  }
  if (!info || !info->subscriptions) return;
  for (const HVServiceSubscriptionContext& context : *info->subscriptions)
    if (context.isSimPresent()) carrierInfoArray_.push_back(makeRecord(context));

  const std::vector<CarrierInfoObject> snapshot = carrierInfoArray_;
  for (const CarrierInfoObject& record : snapshot) {
    processCarrierInfo();
    if (hManager_.isInternalOrCarrierBuild()) fetchBandInfo(record.simSlot);
    copyCellInfo(record.simSlot);
    // Only for the print on the console.
    fetchSignalMeasurements(record.simSlot, [](const auto&, const auto&) {});
  }
}

void HorvaneService::processCarrierInfo() {
  const auto providers = telephony_.networkInfo()->subscriberProviders();
  horvaneServiceLog.log("HorvaneService - processCarrierInfo");
  if (!providers) return;
  for (const auto& [slotKey, carrier] : *providers)
    for (CarrierInfoObject& record : carrierInfoArray_)
      if (record.simSlotKey == slotKey && carrier.carrierName) record.carrierName = *carrier.carrierName;
  selectSubscription();
  NotificationCenter::defaultCenter().post(notification::kCarrierUpdate,
                                           {{notification::kCarriersKey, carrierInfoArray_}});
}

void HorvaneService::selectSubscription() {
  if (hManager_.tabSelectedTitle().empty() || !isSimAdded_) {
    select(carrierInfoArray_.empty() ? nullptr : &carrierInfoArray_.front());
    return;
  }
  for (const CarrierInfoObject& record : carrierInfoArray_)
    if (record.carrierName == hManager_.tabSelectedTitle()) select(&record);
}

/// Null stands for "no subscription at all", which counts as the second one.
void HorvaneService::select(const CarrierInfoObject* record) {
  hManager_.setCurrentSubsId(record != nullptr ? subsIdForSlot(record->simSlot) : 1);
  NotificationCenter::defaultCenter().post(notification::kSubsIdSelectionChange);
}

void HorvaneService::cellMonitorUpdate(const HVServiceSubscriptionContext& context, const HVCellInfo& info) {
  horvaneServiceLog.log("context  ---> %s and info ---> %s", context, info);
  const HVSubscriptionSlot slot = context.slotID();
  if (carrierInfoArray_.empty()) {
    carrierInfoArray_.push_back(makeRecord(context));
  } else if (carrierInfoArray_.size() == 1 && carrierInfoArray_.front().simSlot != slot) {
    carrierInfoArray_.insert(carrierInfoArray_.begin(), makeRecord(context));
  }
  for (CarrierInfoObject& record : carrierInfoArray_)
    if (record.simSlot == slot) record.isSimPresent = context.isSimPresent();
  isSimAdded_ = std::count_if(carrierInfoArray_.begin(), carrierInfoArray_.end(),
                              [](const CarrierInfoObject& record) { return record.isSimPresent; }) == 2;
  std::erase_if(carrierInfoArray_, [](const CarrierInfoObject& record) { return !record.isSimPresent; });

  fetchSignalMeasurementsAndMerge(slot, info);
  processCarrierInfo();
  if (hManager_.isInternalOrCarrierBuild()) fetchBandInfo(slot);
}

void HorvaneService::connectionStateChanged(const HVServiceSubscriptionContext& context,
                                            HVDataConnectionType connection,
                                            HVDataConnectionStatus dataConnectionStatusInfo) {
  horvaneServiceLog.log("context  ---> %{public}s and connection ---> %{public}s and statusinfo %{public}s", context,
                        connection, dataConnectionStatusInfo);
}

void HorvaneService::copyCellInfo(HVSubscriptionSlot slot) {
  client_->copyCellInfo(HVServiceSubscriptionContext::initWithSlot(slot),
                        [weak = weak_from_this(), &mainQueue = mainQueue_, slot](std::optional<HVCellInfo> info,
                                                                                 const std::optional<HVError>& error) {
                          // Off the main thread the service is never locked, so that it cannot come to its end here.
                          if (weak.expired()) return;
                          if (error) {
                            horvaneServiceLog.log("HorvaneService - fetchCellInfo error: %{public}s ", error->text);
                            return;
                          }
                          if (!info) return;
                          mainQueue.async([weak, slot, info = std::move(*info)] {
                            if (const auto self = weak.lock()) self->fetchCellInfo(slot, info);
                          });
                        });
}

void HorvaneService::fetchCellInfo(HVSubscriptionSlot slot, HVCellInfo info) {
  horvaneServiceLog.log("incoming subscription slot  ---> %{public}d", slot);
  fetchSignalMeasurementsAndMerge(slot, std::move(info));
}

// The row of the RSRP carries the measurement's value, so the measurement is always asked for after the cell info.
void HorvaneService::fetchSignalMeasurementsAndMerge(HVSubscriptionSlot slot, HVCellInfo info) {
  fetchSignalMeasurements(
      slot, [weak = weak_from_this(), slot, info = std::move(info)](const auto& measurements, const auto&) {
        const auto self = weak.lock();
        if (self && measurements) self->mergeCellInfo(info, *measurements, slot);
      });
}

void HorvaneService::fetchSignalMeasurements(HVSubscriptionSlot slot, MeasurementsContinuation continuation) {
  const auto context = HVServiceSubscriptionContext::initWithSlot(slot);
  client_->getSignalStrengthMeasurements(
      HVServiceDescriptor::descriptorWithSubscriptionContext(context),
      [weak = weak_from_this(), &mainQueue = mainQueue_, continuation = std::move(continuation)](
          std::optional<HVSignalStrengthMeasurements> measurements, std::optional<HVError> error) {
        mainQueue.async([weak, continuation, measurements = std::move(measurements), error = std::move(error)] {
          const auto self = weak.lock();
          if (!self) return;
          if (error || !measurements) {
            self->console_.print("error occurred " + (error ? error->text : std::string()));
            continuation(std::nullopt, error);
          } else {
            self->console_.print("measurements " + measurements->description);
            continuation(measurements, std::nullopt);
          }
        });
      });
}

void HorvaneService::mergeCellInfo(const HVCellInfo& info, const HVSignalStrengthMeasurements& measurements,
                                   HVSubscriptionSlot slot) {
  if (const auto merged = mergedCellDictionary(info, measurements))
    for (const auto& [key, value] : *merged)
      insertTelephonyRow(cellInfoDBBuilder(kTech, kCellInfo, key, value, subsIdForSlot(slot)));
  for (std::size_t index = 0; index < carrierInfoArray_.size(); ++index) {
    carrierInfoArray_[index].cellInfo.clear();
    refreshCarrierRows(index);
  }
}

void HorvaneService::fetchBandInfo(HVSubscriptionSlot slot) {
  std::optional<HVError> error;
  auto bands = client_->getBandInfo(HVServiceSubscriptionContext::initWithSlot(slot), error);
  if (!bands) return;
  mainQueue_.async([weak = weak_from_this(), bands = std::move(*bands), subsId = subsIdForSlot(slot)] {
    if (const auto self = weak.lock()) self->storeBandRows(bands, subsId);
  });
}

void HorvaneService::storeBandRows(const HVBandInfo& bands, std::int32_t subsId) {
  if (carrierInfoArray_.empty()) return;
  storeBandRows(kActiveBands, bands.activeBands, subsId);
  storeBandRows(kSupportedBands, bands.supportedBands, subsId);
}

void HorvaneService::storeBandRows(const char* metricName, const std::optional<HVBandDictionary>& bands,
                                   std::int32_t subsId) {
  if (!bands) return;
  for (const auto& [radioTechnology, numbers] : *bands)
    insertTelephonyRow(
        cellInfoDBBuilder(kTech, metricName, radioTechnology, fmt::format("{}", fmt::join(numbers, ",")), subsId));
}

Metric HorvaneService::cellInfoDBBuilder(const char* metricTech, const char* metricName,
                                         const std::string& attributeName, const HVCellValue& attributeValue,
                                         std::int32_t subsId) const {
  horvaneServiceLog.log("HorvaneService - cellInfoDBBuilder");
  Metric row;
  row.id = Uuid::make();
  row.metricTech = metricTech;
  row.metricName = metricName;
  row.attributeName = attributeName;
  row.attributeNameNonLocalized = attributeName;
  if (const auto* string = std::get_if<std::string>(&attributeValue)) {
    row.attributeValueType = "STRING";
    row.attributeValue = *string;
  } else if (const auto* number = std::get_if<std::int64_t>(&attributeValue)) {
    row.attributeValueType = "INT";
    row.attributeValue = std::to_string(*number);
  } else {
    horvaneServiceLog.log("unknown type  ---> %{public}s", std::get<HVUnknownValue>(attributeValue).typeName);
  }
  row.collectedOn = clock_.now();
  row.metricId = metricName;
  row.subsId = subsId;
  return row;
}

void HorvaneService::insertTelephonyRow(const Metric& row) {
  Metric copy = row;
  copy.id = Uuid::make();
  copy.graphable = isGraphable(row.metricName, row.attributeName);
  copy.isBookmarked = false;
  copy.sectionNumber.reset();
  // The row is in the store whether the service still lives or not, so its listeners hear of it either way.
  persistanceStore_.insertMetric(copy, [copy](bool success, const std::optional<SQLiteError>& error) {
    if (success) {
      NotificationCenter::defaultCenter().post(notification::kNewHVMetric, {{notification::kMetricObjectKey, copy}});
    } else {
      horvaneServiceLog.error("error occurred while inserting  ---> %{public}s", bareText(error));
    }
  });
}

void HorvaneService::refreshCarrierRows(std::size_t index) {
  refreshCarrierRows(index, kCellInfo, &CarrierInfoObject::cellInfo);
  refreshCarrierRows(index, kActiveBands, &CarrierInfoObject::activeBands);
  refreshCarrierRows(index, kSupportedBands, &CarrierInfoObject::supportedBands);
}

/// Reads by the record's place in the list, not by `subsIdForSlot`: a lone SIM in the second slot so finds nothing.
void HorvaneService::refreshCarrierRows(std::size_t index, const char* metricName,
                                        std::vector<Metric> CarrierInfoObject::*rows) {
  if (index > static_cast<std::size_t>(std::numeric_limits<std::int32_t>::max()))
    fatalStop("HorvaneService: a carrier's index does not fit a subscription id");
  persistanceStore_.fetchMetricContents(
      kTech, metricName, std::nullopt, static_cast<std::int32_t>(index),
      [weak = weak_from_this(), index, rows](std::vector<Metric> metrics, const std::optional<SQLiteError>& error) {
        // A failed read may complete on the database's queue, where the service is neither locked nor touched.
        if (metrics.empty()) {
          if (!weak.expired()) horvaneServiceLog.error("error occured  ---> %{public}s", bareText(error));
          return;
        }
        const auto self = weak.lock();
        // The list may have shrunk while the read was on its way; its rows then belong to nobody.
        if (!self || index >= self->carrierInfoArray_.size()) return;
        self->carrierInfoArray_[index].*rows = std::move(metrics);
      });
}

}  // namespace quorl
