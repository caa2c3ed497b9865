#include <QAbstractItemModelTester>
#include <algorithm>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "screens/view/RowsModel.h"

namespace quorl::view {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

struct Row {
  std::string name;
  int value = 0;

  std::string key() const { return name; }
  QList<int> changedRoles(const Row& next) const {
    return value == next.value ? QList<int>() : QList<int>{Qt::UserRole};
  }
};

class Model final : public RowsModel<Row> {
 public:
  QVariant data(const QModelIndex& index, int role) const override {
    const Row* found = row(index);
    if (found == nullptr) return {};
    return role == Qt::UserRole      ? QVariant(found->value)
           : role == Qt::DisplayRole ? QVariant(QString::fromStdString(found->name))
                                     : QVariant();
  }
};

class RowsModelTest : public ::testing::Test {
 protected:
  void shows(const std::string& names) { model.setRows(rowsOf(names)); }
  static std::vector<Row> rowsOf(const std::string& names) {
    std::vector<Row> rows;
    for (const char name : names) rows.push_back({std::string(1, name), 0});
    return rows;
  }
  std::string shown() const {
    std::string names;
    for (const Row& row : model.rows()) names += row.name;
    return names;
  }
  /// What was announced since the last call, such as "moved 2-2 to 0".
  std::vector<std::string> announced() { return std::exchange(announcements, {}); }

  void SetUp() override {
    QObject::connect(&model, &Model::rowsInserted, &model, [this](const QModelIndex&, int first, int last) {
      announcements.push_back("inserted " + range(first, last));
    });
    QObject::connect(&model, &Model::rowsRemoved, &model, [this](const QModelIndex&, int first, int last) {
      announcements.push_back("removed " + range(first, last));
    });
    QObject::connect(&model, &Model::rowsMoved, &model,
                     [this](const QModelIndex&, int first, int last, const QModelIndex&, int to) {
                       announcements.push_back("moved " + range(first, last) + " to " + std::to_string(to));
                     });
    QObject::connect(&model, &Model::dataChanged, &model, [this](const QModelIndex& first, const QModelIndex& last) {
      announcements.push_back("changed " + range(first.row(), last.row()));
    });
    QObject::connect(&model, &Model::modelReset, &model, [this] { announcements.emplace_back("reset"); });
  }

  Model model;
  QAbstractItemModelTester tester{&model, QAbstractItemModelTester::FailureReportingMode::Fatal};

 private:
  static std::string range(int first, int last) { return std::to_string(first) + "-" + std::to_string(last); }

  std::vector<std::string> announcements;
};

TEST_F(RowsModelTest, TheSameRowsAnnounceNothing) {
  shows("abc");
  announced();
  shows("abc");
  EXPECT_THAT(announced(), IsEmpty());
}

TEST_F(RowsModelTest, AChangedValueIsAnnouncedForItsRowAlone) {
  shows("abc");
  announced();
  model.setRows({{"a", 0}, {"b", 1}, {"c", 0}});
  EXPECT_THAT(announced(), ElementsAre("changed 1-1"));
  EXPECT_EQ(model.data(model.index(1), Qt::UserRole), 1);
}

TEST_F(RowsModelTest, ANewRowComesInAtItsPlace) {
  shows("ac");
  announced();
  shows("abc");
  EXPECT_THAT(announced(), ElementsAre("inserted 1-1"));
}

TEST_F(RowsModelTest, RowsThatAreGoneLeaveInRuns) {
  shows("abcdef");
  announced();
  shows("adf");
  EXPECT_THAT(announced(), ElementsAre("removed 4-4", "removed 1-2"));
}

TEST_F(RowsModelTest, ARowThatHasComeUpMovesAlone) {
  shows("abcde");
  announced();
  shows("eabcd");
  EXPECT_THAT(announced(), ElementsAre("moved 4-4 to 0"));
}

TEST_F(RowsModelTest, ARowThatHasGoneDownMovesAlone) {
  shows("abcde");
  announced();
  shows("bcdea");
  EXPECT_THAT(announced(), ElementsAre("moved 0-0 to 5"));
}

TEST_F(RowsModelTest, RowsOfOneKeyAreToldApartByTheirCount) {
  model.setRows({{"a", 1}, {"a", 2}});
  announced();
  model.setRows({{"a", 1}, {"a", 3}, {"a", 4}});
  EXPECT_THAT(announced(), ElementsAre("inserted 2-2", "changed 1-1"));
}

TEST_F(RowsModelTest, AnyListFollowsAnyOther) {
  std::mt19937 random(7);  // NOLINT: a test's numbers are to be the same in every run
  const auto below = [&](unsigned limit) { return static_cast<unsigned>(random() % limit); };
  for (int round = 0; round < 2000; ++round) {
    std::string names = "abcdefghijklm";
    std::shuffle(names.begin(), names.end(), random);
    names.resize(below(14));
    if (below(2) == 0) std::sort(names.begin(), names.end());
    std::vector<Row> next = rowsOf(names);
    for (Row& row : next) row.value = static_cast<int>(below(3));
    model.setRows(next);
    ASSERT_EQ(shown(), names);
    for (std::size_t i = 0; i < next.size(); ++i) ASSERT_EQ(model.rows()[i].value, next[i].value);
    for (const std::string& announcement : announced()) ASSERT_NE(announcement, "reset");
  }
}

}  // namespace
}  // namespace quorl::view
