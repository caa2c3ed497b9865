#include "telephony/HorvaneViewModel.h"

#include <utility>

#include <fmt/format.h>

#include "shell/NotificationNames.h"

namespace quorl {

HorvaneViewModel::Entries HorvaneViewModel::entriesFromCarriers(const std::vector<CarrierInfoObject>& carriers) {
  Entries entries;
  for (const CarrierInfoObject& record : carriers) {
    if (!record.isSimPresent) continue;
    const std::int32_t subsId = record.simSlotKey == simSlotKeyForSlot(1) ? 0 : 1;
    entries.push_back(std::make_shared<HorvaneViewModel>(record.carrierName, true, subsId, Uuid::make()));
  }
  return entries;
}

void HorvaneViewModel::update(const Entries& entries) {
  carriers_.clear();
  changed_();
  for (const auto& entry : entries) {
    if (!entry->isSimPresent()) continue;
    auto copy = std::make_shared<HorvaneViewModel>(entry->name(), true, entry->subsId(), entry->id());
    carrierCurrentSubsIdMap_.insert_or_assign(copy->name(), copy->subsId());
    carriers_.push_back(std::move(copy));
    changed_();
  }
}

std::string HorvaneViewModel::description() const {
  return fmt::format("({}, {}, {})", name_, isSimPresent_, subsId_);
}

void updateFromCarrierNotification(const Notification& notification, HorvaneViewModel* root) {
  const auto* carriers = notification.entry<std::vector<CarrierInfoObject>>(notification::kCarriersKey);
  if (carriers == nullptr || root == nullptr) return;
  root->update(HorvaneViewModel::entriesFromCarriers(*carriers));
}

}  // namespace quorl
