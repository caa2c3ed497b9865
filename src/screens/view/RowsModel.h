#pragma once

#include <QAbstractListModel>
#include <algorithm>
#include <cstddef>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

namespace quorl::view {

/// A list model that follows a list which is made anew at each refresh: rows are told apart by a key, and only what
/// differs is announced, so that what is on screen stays where it is. Main thread.
///
/// `Row` has `std::string key() const`, and `QList<int> changedRoles(const Row& next) const`, which is empty for rows
/// that look the same.
template <typename Row>
class RowsModel : public QAbstractListModel {
 public:
  using QAbstractListModel::QAbstractListModel;

  int rowCount(const QModelIndex& parent = QModelIndex()) const override {
    return parent.isValid() ? 0 : static_cast<int>(rows_.size());
  }
  const std::vector<Row>& rows() const { return rows_; }

  /// Takes `next` on show: rows that are gone leave, those that stay are moved only if they have to, new ones come in,
  /// and then values change in place.
  void setRows(std::vector<Row> next) {
    std::vector<std::string> nextKeys = keysOf(next);
    PlaceByKey places;
    for (std::size_t i = 0; i < nextKeys.size(); ++i) places.emplace(nextKeys[i], i);
    removeAllBut(places);
    const std::vector<bool> stays = rowsThatStay(places);
    arrange(next, nextKeys, places, stays);
    for (std::size_t i = 0; i < rows_.size(); ++i) {
      const QList<int> roles = rows_[i].changedRoles(next[i]);
      rows_[i] = std::move(next[i]);
      if (!roles.isEmpty()) emit dataChanged(at(i), at(i), roles);
    }
  }

 protected:
  const Row* row(const QModelIndex& index) const {
    if (!index.isValid() || index.row() < 0 || index.row() >= rowCount()) return nullptr;
    return &rows_[static_cast<std::size_t>(index.row())];
  }
  /// Lets `change` alter what is shown in row `i`, which must exist, and announces it.
  template <typename Change>
  void changeRow(std::size_t i, Change&& change) {
    const Row before = rows_[i];
    std::forward<Change>(change)(rows_[i]);
    const QList<int> roles = before.changedRoles(rows_[i]);
    if (!roles.isEmpty()) emit dataChanged(at(i), at(i), roles);
  }

 private:
  using PlaceByKey = std::unordered_map<std::string, std::size_t>;

  QModelIndex at(std::size_t i) const { return index(static_cast<int>(i)); }

  /// Keys that occur twice are told apart by their count.
  static std::vector<std::string> keysOf(const std::vector<Row>& rows) {
    std::vector<std::string> keys;
    keys.reserve(rows.size());
    std::unordered_map<std::string, int> counts;
    for (const Row& row : rows) {
      std::string key = row.key();
      const int count = counts[key]++;
      if (count > 0) key.append("\n").append(std::to_string(count));
      keys.push_back(std::move(key));
    }
    return keys;
  }

  void removeAllBut(const PlaceByKey& places) {
    std::size_t end = rows_.size();
    while (end > 0) {
      if (places.contains(keys_[end - 1])) {
        --end;
        continue;
      }
      std::size_t begin = end - 1;
      while (begin > 0 && !places.contains(keys_[begin - 1])) --begin;
      beginRemoveRows(QModelIndex(), static_cast<int>(begin), static_cast<int>(end - 1));
      erase(begin, end);
      endRemoveRows();
      end = begin;
    }
  }

  void erase(std::size_t begin, std::size_t end) {
    const auto from = static_cast<std::ptrdiff_t>(begin);
    const auto to = static_cast<std::ptrdiff_t>(end);
    rows_.erase(rows_.begin() + from, rows_.begin() + to);
    keys_.erase(keys_.begin() + from, keys_.begin() + to);
  }

  /// By place in the next list: whether the row is part of the longest run of rows that keep their order.
  std::vector<bool> rowsThatStay(const PlaceByKey& places) const {
    std::vector<std::size_t> sequence;
    sequence.reserve(keys_.size());
    for (const std::string& key : keys_) sequence.push_back(places.at(key));
    constexpr auto kNone = static_cast<std::size_t>(-1);
    std::vector<std::size_t> tails, previous(sequence.size(), kNone);
    for (std::size_t i = 0; i < sequence.size(); ++i) {
      const auto tail = std::lower_bound(tails.begin(), tails.end(), sequence[i],
                                         [&](std::size_t a, std::size_t value) { return sequence[a] < value; });
      if (tail != tails.begin()) previous[i] = *(tail - 1);
      if (tail == tails.end()) {
        tails.push_back(i);
      } else {
        *tail = i;
      }
    }
    std::vector<bool> stays(places.size(), false);
    for (std::size_t i = tails.empty() ? kNone : tails.back(); i != kNone; i = previous[i]) stays[sequence[i]] = true;
    return stays;
  }

  void arrange(const std::vector<Row>& next, const std::vector<std::string>& nextKeys, const PlaceByKey& places,
               const std::vector<bool>& stays) {
    for (std::size_t i = 0; i < next.size(); ++i) {
      if (i < keys_.size() && keys_[i] == nextKeys[i]) continue;
      const auto found = std::find(keys_.begin() + static_cast<std::ptrdiff_t>(i), keys_.end(), nextKeys[i]);
      if (found == keys_.end()) {
        insert(i, next[i], nextKeys[i]);
      } else if (const auto from = static_cast<std::size_t>(found - keys_.begin()); stays[places.at(nextKeys[i])]) {
        // What stands in the way goes behind it, and behind all that follows it in both lists.
        std::size_t end = from + 1;
        while (end < keys_.size() && i + end - from < next.size() && keys_[end] == nextKeys[i + end - from]) ++end;
        move(i, from, end);
      } else {
        move(from, from + 1, i);
      }
    }
  }

  void insert(std::size_t at, const Row& row, const std::string& key) {
    beginInsertRows(QModelIndex(), static_cast<int>(at), static_cast<int>(at));
    rows_.insert(rows_.begin() + static_cast<std::ptrdiff_t>(at), row);
    keys_.insert(keys_.begin() + static_cast<std::ptrdiff_t>(at), key);
    endInsertRows();
  }

  /// Moves [begin, end) in front of the row that is at `to` before.
  void move(std::size_t begin, std::size_t end, std::size_t to) {
    beginMoveRows(QModelIndex(), static_cast<int>(begin), static_cast<int>(end - 1), QModelIndex(),
                  static_cast<int>(to));
    rotate(rows_, begin, end, to);
    rotate(keys_, begin, end, to);
    endMoveRows();
  }

  template <typename T>
  static void rotate(std::vector<T>& items, std::size_t begin, std::size_t end, std::size_t to) {
    const auto place = [&](std::size_t i) { return items.begin() + static_cast<std::ptrdiff_t>(i); };
    if (to < begin) {
      std::rotate(place(to), place(begin), place(end));
    } else {
      std::rotate(place(begin), place(end), place(to));
    }
  }

  std::vector<Row> rows_;
  std::vector<std::string> keys_;
};

}  // namespace quorl::view
