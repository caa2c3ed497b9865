#include "store/LatestReadings.h"

namespace quorl::store_detail {

void LatestReadings::clear() {
  lastGroup_ = nullptr;
  groups_.clear();
  metrics_.clear();
}

LatestReadings::Group& LatestReadings::groupFor(const StoredReading& row) {
  if (lastGroup_ != nullptr) {
    const GroupKey& last = *lastGroup_->key;
    if (last.name.subsId == row.subsId && last.name.name == row.metricName && last.metricTech == row.metricTech)
      return *lastGroup_;
  }
  const NameView name{row.subsId, row.metricName};
  auto group = groups_.find(GroupView{name, row.metricTech});
  if (group == groups_.end()) {
    auto metric = metrics_.find(name);
    if (metric == metrics_.end())
      metric = metrics_.emplace(Name{row.subsId, std::string(row.metricName)}, LatestOfName{}).first;
    group = groups_.emplace(GroupKey{metric->first, std::string(row.metricTech)}, Group{}).first;
    group->second.key = &group->first;
    group->second.latestOfName = &metric->second;
  }
  lastGroup_ = &group->second;
  return *lastGroup_;
}

LatestReadings::Place LatestReadings::placeOf(const StoredReading& row) {
  Group& group = groupFor(row);
  auto reading = group.readings.find(row.attributeName);
  if (reading == group.readings.end())
    reading = group.readings.emplace(std::string(row.attributeName), Reading{}).first;
  return {group, reading->second};
}

void LatestReadings::put(Place place, const StoredReading& row) {
  Reading& reading = place.reading;
  reading.attributeValue = row.attributeValue;
  reading.attributeValueType = row.attributeValueType;
  reading.metricId = row.metricId;
  reading.collectedOn = row.collectedOn;
  reading.graphable = row.graphable;
}

void LatestReadings::putName(Place place, const StoredReading& row) {
  LatestOfName& latest = *place.group.latestOfName;
  latest.metricTech = row.metricTech;
  latest.collectedOn = row.collectedOn;
}

void LatestReadings::add(const StoredReading& row) {
  const Place place = placeOf(row);
  if (row.collectedOn <= place.reading.collectedOn) return;
  put(place, row);
  if (row.collectedOn > place.group.latestOfName->collectedOn) putName(place, row);
}

const LatestReadings::Group* LatestReadings::groupOf(std::string_view metricTech, std::string_view metricName,
                                                     std::int32_t subsId) const {
  const auto found = groups_.find(GroupView{{subsId, metricName}, metricTech});
  return found == groups_.end() ? nullptr : &found->second;
}

std::optional<StoredReading> LatestReadings::reading(std::string_view metricTech, std::string_view metricName,
                                                     std::string_view attributeName, std::int32_t subsId) const {
  const Group* const group = groupOf(metricTech, metricName, subsId);
  if (group == nullptr) return std::nullopt;
  const auto found = group->readings.find(attributeName);
  if (found == group->readings.end()) return std::nullopt;
  return rowOf(*group, found->first, found->second);
}

StoredReading LatestReadings::rowOf(const Group& group, std::string_view attributeName, const Reading& reading) {
  return {group.key->metricTech,  group.key->name.name,       attributeName,
          reading.attributeValue, reading.attributeValueType, reading.graphable,
          reading.metricId,       group.key->name.subsId,     reading.collectedOn};
}

}  // namespace quorl::store_detail
