#pragma once

#include <cstdint>
#include <initializer_list>
#include <string_view>

#include "store/LatestReadings.h"

struct sqlite3;

namespace quorl::store_detail {

/// The latest readings of a connection's `Metric` table, for as long as they are what the statements would answer.
///
/// The first read runs its statement; the next one that finds the table unchanged, or changed by inserts alone that
/// were told here, reads all rows once, and from then on inserts keep the readings current. They are given up, and the
/// next read runs its statement again, after any change that was not told: of this connection (seen by its count of
/// changes), of another one (seen by the file's data version), of the schema, and after an insert that failed. A table
/// that is not as this program makes it, or that holds what this program does not write, is left to the statements.
///
/// It never changes the file. On the database's queue alone, between statements.
class KeptReadings {
 public:
  /// Whether the build keeps readings at all. Without them every read runs its statement, with the same answers.
  static bool areKept();

  explicit KeptReadings(sqlite3* connection) : connection_(connection) {}
  KeptReadings(const KeptReadings&) = delete;
  KeptReadings& operator=(const KeptReadings&) = delete;

  /// The readings if they answer now, good until the next call. Otherwise null; then the statement has to run.
  const LatestReadings* current();
  /// A statement has answered, and is done, because `current` did not.
  void statementHasAnswered();

  /// The insert of `row` has just been stepped.
  void hasInserted(const StoredReading& row);
  /// A statement on `Dashboard` alone has just been stepped.
  void dashboardHasChanged();
  /// Something else has happened.
  void giveUp();

  /// Whether a statement that has these texts in double quotes compares with them, rather than with a column or with
  /// less than the whole text.
  static bool areTakenAsTexts(std::initializer_list<std::string_view> values);

 private:
  enum class Stage {
    unread,  // no statement has answered since the last unseen change
    read,    // one has
    kept,
    refused,  // the statements have to answer until the next unseen change
  };
  /// What the connection has seen of the file.
  struct Seen {
    std::int64_t changes = 0;
    std::uint32_t version = 0;
    friend bool operator==(const Seen&, const Seen&) = default;
  };

  Seen seen() const;
  /// Whether the connection has changed since `seen_` by one statement of `changes` rows, and nothing else has.
  bool hasChangedByOne(std::int64_t changes) const;
  bool looksAtFile() const;
  bool isOwnTable() const;
  Stage load();

  sqlite3* const connection_;
  Stage stage_ = Stage::unread;
  Seen seen_;
  LatestReadings readings_;
};

}  // namespace quorl::store_detail
