#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>
#include <sqlite3.h>

namespace quorl::test {

using Row = std::vector<std::string>;

/// Runs `sql` and answers its rows; NULL reads as "NULL". A statement that fails fails the test.
inline std::vector<Row> run(sqlite3* database, const std::string& sql) {
  std::vector<Row> rows;
  const auto collect = [](void* context, int count, char** values, char** /*names*/) {
    Row row;
    for (int i = 0; i < count; ++i) row.emplace_back(values[i] != nullptr ? values[i] : "NULL");
    static_cast<std::vector<Row>*>(context)->push_back(std::move(row));
    return 0;
  };
  char* error = nullptr;
  EXPECT_EQ(sqlite3_exec(database, sql.c_str(), collect, &rows, &error), SQLITE_OK) << sql << ": " << error;
  sqlite3_free(error);
  return rows;
}

/// A connection of the test's own, beside the product's.
class RawDatabase {
 public:
  explicit RawDatabase(const std::filesystem::path& path) {
    EXPECT_EQ(sqlite3_open(path.c_str(), &database_), SQLITE_OK);
  }
  ~RawDatabase() { sqlite3_close(database_); }
  RawDatabase(const RawDatabase&) = delete;
  RawDatabase& operator=(const RawDatabase&) = delete;

  std::vector<Row> run(const std::string& sql) { return test::run(database_, sql); }
  /// The first column of the rows.
  std::vector<std::string> column(const std::string& sql) {
    std::vector<std::string> values;
    for (const Row& row : run(sql)) values.push_back(row.front());
    return values;
  }

 private:
  sqlite3* database_ = nullptr;
};

/// Records the texts of all statements that a connection steps while this lives.
class StatementTrace {
 public:
  explicit StatementTrace(sqlite3* database) : database_(database) {
    sqlite3_trace_v2(database, SQLITE_TRACE_STMT, &record, &texts_);
  }
  ~StatementTrace() { sqlite3_trace_v2(database_, 0, nullptr, nullptr); }
  StatementTrace(const StatementTrace&) = delete;
  StatementTrace& operator=(const StatementTrace&) = delete;

  const std::vector<std::string>& texts() const { return texts_; }

  static int record(unsigned /*kind*/, void* context, void* statement, void* /*text*/) {
    static_cast<std::vector<std::string>*>(context)->emplace_back(sqlite3_sql(static_cast<sqlite3_stmt*>(statement)));
    return 0;
  }

 private:
  sqlite3* const database_;
  std::vector<std::string> texts_;
};

}  // namespace quorl::test
