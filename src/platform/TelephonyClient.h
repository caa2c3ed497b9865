#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "base/Queue.h"

// The platform's telephony client, as far as the product needs it.

namespace quorl {

/// A SIM slot as the telephony client numbers it: 1 is the first.
using HVSubscriptionSlot = std::int32_t;

/// An error of the telephony client; `text` is for logs.
struct HVError {
  std::string text;
};

/// One subscription slot.
class HVServiceSubscriptionContext {
 public:
  static HVServiceSubscriptionContext initWithSlot(HVSubscriptionSlot slot) { return {slot, false}; }
  HVServiceSubscriptionContext(HVSubscriptionSlot slotId, bool isSimPresent)
      : slotID_(slotId), isSimPresent_(isSimPresent) {}

  HVSubscriptionSlot slotID() const { return slotID_; }
  bool isSimPresent() const { return isSimPresent_; }

 private:
  HVSubscriptionSlot slotID_;
  bool isSimPresent_;
};

struct HVServiceSubscriptionInfo {
  std::optional<std::vector<HVServiceSubscriptionContext>> subscriptions;
};

/// A value of a cell dictionary: an integer, a text, or a kind that the product does not know, named for logs.
struct HVUnknownValue {
  std::string typeName;
};
using HVCellValue = std::variant<std::int64_t, std::string, HVUnknownValue>;
/// Keys in the client's order.
using HVCellDictionary = std::vector<std::pair<std::string, HVCellValue>>;

/// Serving cell data of a slot. An element that is no dictionary is empty (`nullopt`).
struct HVCellInfo {
  std::optional<std::vector<std::optional<HVCellDictionary>>> legacyInfo;
};

/// Names the slot whose measurements are asked for.
class HVServiceDescriptor {
 public:
  static HVServiceDescriptor descriptorWithSubscriptionContext(const HVServiceSubscriptionContext& context) {
    return HVServiceDescriptor(context);
  }
  const HVServiceSubscriptionContext& context() const { return context_; }

 private:
  explicit HVServiceDescriptor(const HVServiceSubscriptionContext& context) : context_(context) {}
  HVServiceSubscriptionContext context_;
};

struct HVSignalStrengthMeasurements {
  std::optional<std::int64_t> rsrp;  // dBm
  std::string description;           // for the console
};

/// Band numbers by radio technology, in the client's order.
using HVBandDictionary = std::vector<std::pair<std::string, std::vector<std::int64_t>>>;

struct HVBandInfo {
  std::optional<HVBandDictionary> activeBands;
  std::optional<HVBandDictionary> supportedBands;
};

struct HVCarrier {
  std::optional<std::string> carrierName;
};

/// The carriers of the slots, asked for anew each time.
class HVTelephonyNetworkInfo {
 public:
  virtual ~HVTelephonyNetworkInfo() = default;
  /// Carrier by slot key, or nothing when the map is absent.
  virtual std::optional<std::map<std::string, HVCarrier>> subscriberProviders() = 0;
};

enum class HVDataConnectionType : std::uint8_t { Default, Internet, Ims, Other };
enum class HVDataConnectionStatus : std::uint8_t { Unknown, Disconnected, Connecting, Connected, Disconnecting };

class HorvaneClientRegistrationDelegate {
 public:
  virtual ~HorvaneClientRegistrationDelegate() = default;
  /// New serving cell data; also tells of a SIM that came or went. On the client's queue.
  virtual void cellMonitorUpdate(const HVServiceSubscriptionContext& context, const HVCellInfo& info) = 0;
};

class HorvaneClientDataDelegate {
 public:
  virtual ~HorvaneClientDataDelegate() = default;
  /// On the client's queue.
  virtual void connectionStateChanged(const HVServiceSubscriptionContext& context, HVDataConnectionType connection,
                                      HVDataConnectionStatus dataConnectionStatusInfo) = 0;
};

class HorvaneClientDelegate : public HorvaneClientRegistrationDelegate, public HorvaneClientDataDelegate {};

/// The client. Asked on the main thread.
class HorvaneClient {
 public:
  virtual ~HorvaneClient() = default;

  /// Weak: the client never keeps its delegate alive. Null for none.
  virtual void setDelegate(std::weak_ptr<HorvaneClientDelegate> delegate) = 0;
  /// Completes on the client's queue.
  virtual void getSubscriptionInfo(
      std::function<void(std::optional<HVServiceSubscriptionInfo>, std::optional<HVError>)> completion) = 0;
  /// Completes on any thread.
  virtual void copyCellInfo(const HVServiceSubscriptionContext& context,
                            std::function<void(std::optional<HVCellInfo>, std::optional<HVError>)> completion) = 0;
  /// Completes on any thread.
  virtual void getSignalStrengthMeasurements(
      const HVServiceDescriptor& descriptor,
      std::function<void(std::optional<HVSignalStrengthMeasurements>, std::optional<HVError>)> completion) = 0;
  /// Synchronous. Nothing on failure, with `error` filled.
  virtual std::optional<HVBandInfo> getBandInfo(const HVServiceSubscriptionContext& context,
                                                std::optional<HVError>& error) = 0;
};

class HorvaneClientFactory {
 public:
  virtual ~HorvaneClientFactory() = default;
  /// A client whose delegate calls and subscription completions run on `queue`.
  virtual std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) = 0;
  virtual std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() = 0;
};

}  // namespace quorl
