#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "base/NotificationCenter.h"
#include "base/Signal.h"
#include "base/Uuid.h"
#include "telephony/CarrierInfoObject.h"

namespace quorl {

/// Both the root of the carrier bar and one entry of it. The root uses the map and `carriers`, an entry the first four
/// fields. Main thread.
class HorvaneViewModel {
 public:
  using Entries = std::vector<std::shared_ptr<const HorvaneViewModel>>;
  /// Ends the observation when it goes away.
  using Observation = Connection;

  /// The root as the shell makes it: no name, no SIM, subscription 0.
  HorvaneViewModel() : HorvaneViewModel("", false, 0, Uuid::make()) {}
  HorvaneViewModel(std::string name, bool isSimPresent, std::int32_t subsId, Uuid id)
      : name_(std::move(name)), isSimPresent_(isSimPresent), subsId_(subsId), id_(id) {}
  HorvaneViewModel(const HorvaneViewModel&) = delete;
  HorvaneViewModel& operator=(const HorvaneViewModel&) = delete;

  /// The records with a SIM as new entries, in order.
  static Entries entriesFromCarriers(const std::vector<CarrierInfoObject>& carriers);

  const std::string& name() const { return name_; }
  bool isSimPresent() const { return isSimPresent_; }
  /// 0 or 1.
  std::int32_t subsId() const { return subsId_; }
  const Uuid& id() const { return id_; }
  /// Carrier name to subscription id. Names are never removed, and two carriers of one name share the later one's.
  const std::map<std::string, std::int32_t, std::less<>>& carrierCurrentSubsIdMap() const {
    return carrierCurrentSubsIdMap_;
  }
  /// One entry for each shown tab.
  const Entries& carriers() const { return carriers_; }

  /// Takes over copies of those `entries` that have a SIM. Announces a change once `carriers` is empty and again after
  /// each entry.
  void update(const Entries& entries);
  /// `handler` runs inside `update`, with the announced state in place.
  [[nodiscard]] Observation observeChanges(std::function<void()> handler) { return changed_.connect(handler); }

  /// "(name, true, 0)".
  std::string description() const;

 private:
  const std::string name_;
  const bool isSimPresent_;
  const std::int32_t subsId_;
  const Uuid id_;
  std::map<std::string, std::int32_t, std::less<>> carrierCurrentSubsIdMap_;
  Entries carriers_;
  Signal<> changed_;
};

/// What the shell does on "carrierUpdate": brings `root` up to date with the notification's carriers. A notification
/// without them is ignored, and so is any while there is no root (null).
void updateFromCarrierNotification(const Notification& notification, HorvaneViewModel* root);

}  // namespace quorl
