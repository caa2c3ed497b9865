#include <chrono>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <string>
#include <string_view>
#include <vector>

#include <grp.h>
#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/wait.h>
#include <unistd.h>

#include "faults/BreakablePhone.h"

namespace quorl::test {
namespace {

namespace fs = std::filesystem;

class UnusableDatabase : public testing::Test {
 protected:
  /// A file that the product has filled, with all of its rows in it and none in a journal.
  void hasBeenUsed(std::size_t metrics = 20) {
    phone.launch();
    phone.metricsArrive(metrics);
    phone.ends();
    ASSERT_FALSE(fs::exists(phone.file().string() + "-wal"));
    phone.errors->clear();
  }
  /// The product starts, shows its screens, takes metrics and comes to an end.
  void isUsed(std::size_t metrics = 5) {
    phone.launch();
    phone.metricsArrive(metrics);
    phone.screens().menuBarDidSelectItemAt(1);
    phone.passes(std::chrono::minutes(1));
    phone.ends();
  }
  void writes(const std::string& content) {
    std::ofstream(phone.file(), std::ios::binary | std::ios::trunc) << content;
  }

  BreakablePhone phone;
};

TEST_F(UnusableDatabase, ATextInItsPlaceIsToldAndLeftAsItIs) {
  const std::string text(5000, 'q');
  writes(text);
  isUsed();
  EXPECT_EQ(phone.errors->count("Prepare(message: \"file is not a database\") error ocurred while creating a table"),
            2U);
  EXPECT_EQ(phone.errors->count("error occurred while inserting  ---> Optional(Prepare(message: \"file is not a "
                                "database\"))"),
            5 * kRowsOfNasEvent);
  EXPECT_EQ(contentOf(phone.file()), text);
}

TEST_F(UnusableDatabase, ADatabaseOfSomebodyElseKeepsItsTables) {
  {
    RawDatabase other(phone.file());
    other.run("CREATE TABLE Metric (length REAL)");
    other.run("INSERT INTO Metric VALUES (1.5)");
  }
  isUsed();
  EXPECT_EQ(phone.errors->countContaining("table Metric has no column named metric_tech"), 5 * kRowsOfNasEvent);
  EXPECT_EQ(RawDatabase(phone.file()).run("SELECT * FROM Metric"), std::vector<Row>{{"1.5"}});
}

TEST_F(UnusableDatabase, AFolderInItsPlaceEndsTheProcessWithTheReason) {
  fs::create_directory(phone.file());
  EXPECT_DEATH(phone.launch(), "Fatal error: OpenDatabase\\(message: \"unable to open database file\"\\)");
}

TEST_F(UnusableDatabase, NoDocumentsDirectoryEndsTheProcessWithTheReason) {
  phone.host.documents.directory.reset();
  EXPECT_DEATH(phone.launch(), "Fatal error: databasePath is nil");
}

TEST_F(UnusableDatabase, WhereverItIsCutOffTheProgramRunsOnAndCutsNothingMore) {
  hasBeenUsed(100);
  const std::string whole = contentOf(phone.file());
  std::mt19937 random(1);
  int refused = 0;
  for (int cut = 0; cut < 30; ++cut) {
    // Near the beginning, at the pages' borders, and anywhere but in the last page, of which SQLite misses nothing.
    const std::size_t left = cut < 5    ? static_cast<std::size_t>(cut) * 33
                             : cut < 12 ? static_cast<std::size_t>(cut - 4) * 4096
                                        : random() % (whole.size() - 4096);
    const std::string content = whole.substr(0, left);
    writes(content);
    phone.errors->clear();
    isUsed();
    const std::string after = contentOf(phone.file());
    if (phone.lostRows() == 0) {
      EXPECT_EQ(phone.integrity(), "ok") << "of " << left << " bytes";
    } else {
      ++refused;
      EXPECT_GT(phone.errors->countContaining("database disk image is malformed") +
                    phone.errors->countContaining("file is not a database"),
                0U);
      EXPECT_EQ(after, content) << "what a rescue would need, of " << left << " bytes";
    }
  }
  EXPECT_GT(refused, 20);
  figure("cuts", 30);
  figure("files refused and left as they were", static_cast<std::size_t>(refused));
}

TEST_F(UnusableDatabase, WhateverIsWrongInItTheProgramRunsOn) {
  hasBeenUsed(40);
  const std::string whole = contentOf(phone.file());
  std::mt19937 random(2);
  std::size_t lost = 0;
  const std::size_t reportedBefore = phone.reportedRows;
  for (int damage = 0; damage < 60; ++damage) {
    std::string content = whole;
    for (std::size_t octets = 1 + random() % 40; octets > 0; --octets)
      content[random() % content.size()] = static_cast<char>(random());
    writes(content);
    phone.errors->clear();
    const std::size_t reported = phone.reportedRows;
    isUsed();
    EXPECT_EQ(phone.reportedRows - reported + phone.lostRows(), 5 * kRowsOfNasEvent) << "of damage " << damage;
    lost += phone.lostRows();
  }
  figure("damaged files", 60);
  figure("rows stored in them", phone.reportedRows - reportedBefore);
  figure("rows lost, each told", lost);
}

TEST_F(UnusableDatabase, AJournalThatIsCutOffCostsWhatCameAfterTheCut) {
  phone.launch();
  phone.metricsArrive(20);
  const fs::path journal = phone.file().string() + "-wal";
  const std::string database = contentOf(phone.file());
  const std::string whole = contentOf(journal);
  phone.ends();
  std::mt19937 random(3);
  for (int cut = 0; cut < 20; ++cut) {
    writes(database);
    std::ofstream(journal, std::ios::binary | std::ios::trunc) << whole.substr(0, random() % whole.size());
    phone.errors->clear();
    isUsed();
    EXPECT_EQ(phone.lostRows(), 0U);
    EXPECT_EQ(phone.integrity(), "ok");
  }
}

/// Another process that holds the database for itself until it is let go.
class Holder {
 public:
  Holder(const fs::path& file, const char* sql) {
    int ready[2];
    int release[2];
    EXPECT_EQ(pipe(ready), 0);
    EXPECT_EQ(pipe(release), 0);
    process_ = fork();
    if (process_ == 0) {
      close(release[1]);
      sqlite3* database = nullptr;
      const bool holds = sqlite3_open(file.c_str(), &database) == SQLITE_OK &&
                         sqlite3_exec(database, sql, nullptr, nullptr, nullptr) == SQLITE_OK;
      char answer = holds ? 'y' : 'n';
      if (::write(ready[1], &answer, 1) != 1) ::_exit(1);
      [[maybe_unused]] const ssize_t ended = ::read(release[0], &answer, 1);
      ::_exit(0);
    }
    close(ready[1]);
    close(release[0]);
    char answer = 'n';
    EXPECT_EQ(::read(ready[0], &answer, 1), 1);
    EXPECT_EQ(answer, 'y');
    close(ready[0]);
    release_ = release[1];
  }
  ~Holder() {
    close(release_);
    waitpid(process_, nullptr, 0);
  }
  Holder(const Holder&) = delete;
  Holder& operator=(const Holder&) = delete;

 private:
  pid_t process_ = 0;
  int release_ = -1;
};

TEST_F(UnusableDatabase, HeldByAnotherProcessItTakesNoRowsUntilItIsFree) {
  hasBeenUsed();
  const std::size_t before = phone.reportedRows;
  {
    const Holder holder(phone.file(), "BEGIN EXCLUSIVE");
    phone.launch();
    phone.metricsArrive(20);
    EXPECT_EQ(phone.errors->count("database is locked error ocurred while creating a table (sqlite3_step)"), 1U)
        << "the rows of thirty days ago stay until a later start";
    EXPECT_EQ(phone.errors->count("error occurred while inserting  ---> Optional(Prepare(message: \"database is "
                                  "locked\"))"),
              20 * kRowsOfNasEvent);
    phone.screens().menuBarDidSelectItemAt(1);
    phone.host.time.settle();
    const auto& table = phone.screens().firstLevelViewController()->table();
    ASSERT_EQ(table.size(), 2U);
    EXPECT_EQ(table[1].metricTech, "LTE") << "what is there can be read";
  }
  phone.errors->clear();
  phone.metricsArrive(20);
  EXPECT_EQ(phone.lostRows(), 0U);
  EXPECT_EQ(phone.storedRows(), before + 20 * kRowsOfNasEvent);
  EXPECT_EQ(phone.integrity(), "ok");
}

TEST_F(UnusableDatabase, HeldWithoutAJournalItIsNotEvenReadUntilItIsFree) {
  hasBeenUsed();
  {
    const Holder holder(phone.file(), "PRAGMA journal_mode=DELETE; BEGIN EXCLUSIVE");
    phone.launch();
    EXPECT_EQ(phone.errors->count("Prepare(message: \"database is locked\") error ocurred while creating a table"), 2U);
    phone.metricsArrive(20);
    EXPECT_EQ(phone.lostRows(), 20 * kRowsOfNasEvent);
  }
  phone.errors->clear();
  phone.metricsArrive(20);
  EXPECT_EQ(phone.lostRows(), 0U);
  EXPECT_EQ(phone.storedRows(), phone.reportedRows);
}

constexpr uid_t kNobody = 65534;

/// Root may write everywhere.
void becomeAnOrdinaryUser() {
  if (geteuid() != 0) return;
  if (setgroups(0, nullptr) != 0 || setgid(kNobody) != 0 || setuid(kNobody) != 0) std::_Exit(2);
}

/// A documents directory that its owner, no root, may only read.
class ReadOnlyDocuments : public UnusableDatabase {
 protected:
  void documentsCanOnlyBeRead() {
    if (geteuid() == 0) {
      for (const auto& entry : fs::directory_iterator(documents())) give(entry.path());
      give(documents());
    }
    fs::permissions(documents(), fs::perms(0500));
  }
  ~ReadOnlyDocuments() override { fs::permissions(documents(), fs::perms(0700)); }

  const fs::path& documents() const { return *phone.host.documents.directory; }
  /// In the child of a death test: what it logs as errors goes to where the test looks.
  void startsAsAnOrdinaryUser() {
    becomeAnOrdinaryUser();
    phone.errors->onLine = [](std::string_view line) {
      std::fprintf(stderr, "%.*s\n", static_cast<int>(line.size()), line.data());
    };
    phone.launch();
  }

 private:
  static void give(const fs::path& path) { ASSERT_EQ(chown(path.c_str(), kNobody, kNobody), 0); }
};

TEST_F(ReadOnlyDocuments, WithoutADatabaseEndTheProcessWithTheReason) {
  documentsCanOnlyBeRead();
  EXPECT_DEATH(startsAsAnOrdinaryUser(), "Fatal error: OpenDatabase\\(message: \"unable to open database file\"\\)");
}

TEST_F(ReadOnlyDocuments, WithADatabaseAreToldAndKeepWhatIsInIt) {
  hasBeenUsed();
  documentsCanOnlyBeRead();
  const std::string before = contentOf(phone.file());
  EXPECT_EXIT(
      {
        startsAsAnOrdinaryUser();
        phone.metricsArrive(5);
        EXPECT_EQ(phone.lostRows(), 5 * kRowsOfNasEvent);
        std::_Exit(HasFailure() ? 1 : 0);
      },
      testing::ExitedWithCode(0),
      "error occurred while inserting  ---> Optional\\(Prepare\\(message: \"attempt to write a readonly "
      "database\"\\)\\)");
  EXPECT_EQ(contentOf(phone.file()), before);

  fs::permissions(documents(), fs::perms(0700));
  phone.launch();
  phone.metricsArrive(5);
  EXPECT_EQ(phone.lostRows(), 0U);
  EXPECT_EQ(phone.storedRows(), 25 * kRowsOfNasEvent);
}

}  // namespace
}  // namespace quorl::test
