#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <random>
#include <string>
#include <vector>

#include "store/DBManager.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"

namespace quorl::test {

/// Does at random what can happen to the rows of `Metric`: inserts, failed ones among them, removals of all kinds,
/// writes of another connection, own transactions, rows and indexes that this program never makes. Between them it
/// reads, and compares each answer with what the same statement answers on the same state.
///
/// Names, attributes and times are few, so that many rows share a second; some mean a column when they stand in double
/// quotes, or do not prepare.
class ReadingsDriver {
 public:
  /// `database` has its tables. The platform's queues must be stepped ones.
  ReadingsDriver(unsigned seed, FakePlatform& platform, std::shared_ptr<SQLiteDatabase> database,
                 const std::string& path);
  ~ReadingsDriver();
  ReadingsDriver(const ReadingsDriver&) = delete;
  ReadingsDriver& operator=(const ReadingsDriver&) = delete;

  void step();
  /// Only reads: every list, every metric and every attribute of both subscriptions, twice.
  void readEverything();

  /// The first answer that differs from its statement's, with both; empty while there is none.
  const std::string& difference() const { return difference_; }
  std::size_t reads() const { return reads_; }
  /// How many of them did not step their statement.
  std::size_t readsFromMemory() const { return readsFromMemory_; }

 private:
  unsigned upTo(unsigned count) { return static_cast<unsigned>(random_() % count); }
  Metric reading();
  std::string sqlRow();

  void insert();
  void insertThatFails();
  void readList(std::int32_t subsId);
  void readContents(const std::string& tech, const std::string& name, const std::optional<std::string>& attribute,
                    std::int32_t subsId);
  void pinOrUnpin();
  void writeByAnother();
  void indexByAnother();
  void oddRowByAnother();
  void changeUntold();
  void statementOnMetric();
  void transaction();
  void thinOut();

  std::string removal();
  void own(const std::string& sql);
  void compare(const std::string& sql, const std::string& answer, const std::string& expected);
  /// What a read must answer by the rows of `sql` on the product's connection, in the form of `compare`; `timeColumn`
  /// is that of the date, `isList` tells the list of metrics from the contents of one.
  std::string expected(const std::string& sql, std::size_t timeColumn, bool isList);

  std::mt19937 random_;
  FakePlatform& platform_;
  const std::shared_ptr<SQLiteDatabase> database_;
  RawDatabase other_;
  std::vector<std::string> stepped_;
  std::string difference_;
  std::size_t reads_ = 0;
  std::size_t readsFromMemory_ = 0;
  std::size_t rows_ = 0;
  bool hasIndex_ = false;
};

}  // namespace quorl::test
