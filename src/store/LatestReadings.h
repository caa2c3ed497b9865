#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace quorl::store_detail {

/// A row of `Metric` as the reads of latest values see it, without copies of its texts.
struct StoredReading {
  std::string_view metricTech;
  std::string_view metricName;
  std::string_view attributeName;  // raw
  std::string_view attributeValue;
  std::string_view attributeValueType;
  bool graphable = false;
  std::string_view metricId;
  std::int32_t subsId = 0;
  std::string_view collectedOn;  // as stored
};

/// The latest row of each attribute and, for the listing, of each metric name: what the statements answer, in their
/// order, of the rows that it was told of. Of the rows of one second the one inserted first counts, as with them.
///
/// It knows nothing of the database, nor whether it was told of all rows. What it holds grows with the number of
/// attributes, not of rows. One thread at a time; answers are valid until the next change.
class LatestReadings {
 public:
  LatestReadings() = default;
  LatestReadings(const LatestReadings&) = delete;
  LatestReadings& operator=(const LatestReadings&) = delete;

  void clear();
  /// A row that was inserted after all others.
  void add(const StoredReading& row);
  /// A row that was inserted before all others. Its key and its time are enough; `complete` is called with it for the
  /// rest if it counts.
  template <typename Complete>
  void addEarlier(StoredReading row, const Complete& complete) {
    const Place place = placeOf(row);
    if (row.collectedOn < place.reading.collectedOn) return;
    complete(row);
    put(place, row);
    // The latest row of a name is the latest of its attribute, too.
    if (row.collectedOn >= place.group.latestOfName->collectedOn) putName(place, row);
  }

  /// Calls `visit` with each metric of a subscription, sorted by name: `metricTech`, `metricName`, `subsId` and
  /// `collectedOn` of its latest row.
  template <typename Visit>
  void eachMetric(std::int32_t subsId, const Visit& visit) const {
    for (auto at = metrics_.lower_bound(NameView{subsId, {}}); at != metrics_.end() && at->first.subsId == subsId;
         ++at) {
      StoredReading row;
      row.metricTech = at->second.metricTech;
      row.metricName = at->first.name;
      row.subsId = subsId;
      row.collectedOn = at->second.collectedOn;
      visit(row);
    }
  }
  /// Calls `visit` with the latest row of each attribute of a metric, sorted by attribute.
  template <typename Visit>
  void eachReading(std::string_view metricTech, std::string_view metricName, std::int32_t subsId,
                   const Visit& visit) const {
    const Group* const group = groupOf(metricTech, metricName, subsId);
    if (group == nullptr) return;
    for (const auto& [attributeName, reading] : group->readings) visit(rowOf(*group, attributeName, reading));
  }
  /// The latest row of one attribute, if it has any.
  std::optional<StoredReading> reading(std::string_view metricTech, std::string_view metricName,
                                       std::string_view attributeName, std::int32_t subsId) const;

 private:
  /// The key of a metric in the listing, where a name of two technologies is one metric.
  struct NameView {
    std::int32_t subsId;
    std::string_view name;
  };
  struct Name {
    std::int32_t subsId;
    std::string name;
    operator NameView() const { return {subsId, name}; }
  };
  struct GroupView {
    NameView name;
    std::string_view metricTech;
  };
  struct GroupKey {
    Name name;
    std::string metricTech;
    operator GroupView() const { return {name, metricTech}; }
  };
  /// By subscription and then by bytes, as the statements sort texts.
  struct Less {
    using is_transparent = void;
    bool operator()(const NameView& a, const NameView& b) const {
      return a.subsId != b.subsId ? a.subsId < b.subsId : a.name < b.name;
    }
    bool operator()(const GroupView& a, const GroupView& b) const {
      if ((*this)(a.name, b.name)) return true;
      if ((*this)(b.name, a.name)) return false;
      return a.metricTech < b.metricTech;
    }
  };
  struct LatestOfName {
    std::string metricTech;
    std::string collectedOn;
  };
  struct Reading {
    std::string attributeValue;
    std::string attributeValueType;
    std::string metricId;
    std::string collectedOn;  // empty until a row has been put
    bool graphable = false;
  };
  /// The attributes of a metric of one technology.
  struct Group {
    const GroupKey* key = nullptr;
    LatestOfName* latestOfName = nullptr;
    std::map<std::string, Reading, std::less<>> readings;
  };
  struct Place {
    Group& group;
    Reading& reading;
  };

  Group& groupFor(const StoredReading& row);
  Place placeOf(const StoredReading& row);
  static void put(Place place, const StoredReading& row);
  static void putName(Place place, const StoredReading& row);
  const Group* groupOf(std::string_view metricTech, std::string_view metricName, std::int32_t subsId) const;
  static StoredReading rowOf(const Group& group, std::string_view attributeName, const Reading& reading);

  std::map<Name, LatestOfName, Less> metrics_;
  std::map<GroupKey, Group, Less> groups_;
  Group* lastGroup_ = nullptr;  // the attributes of a message come one after the other
};

}  // namespace quorl::store_detail
