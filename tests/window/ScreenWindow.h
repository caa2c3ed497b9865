#pragma once

#include <QString>
#include <chrono>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "store/PersistanceStore.h"
#include "support/TimeZoneAndLocale.h"
#include "support/window/WindowFixture.h"

namespace quorl::test {

class RawDatabase;

/// The product in its window on a phone in UTC and American English, with rows of an earlier run and rows that arrive.
/// The clock starts beside the machine's, as SQLite works out limits by that.
class ScreenWindowTest : public WindowTest {
 protected:
  ScreenWindowTest();
  ~ScreenWindowTest() override;

  /// A reading taken now.
  Metric reading(std::string metricTech, std::string metricName, std::string attributeName, std::string value,
                 std::int32_t subsId = 0) const;

  // The file as an earlier run has left it. To be told before the launch.
  void hasStored(const Metric& metric);
  void hasPinned(const Metric& metric);
  /// Two readings on the dashboard, the fewest that count.
  void hasADashboard();

  // The fixture's verbs, after each of which the window is drawn, as lists make their rows only then.
  void launch() {
    drawn([this] { WindowTest::launch(); });
  }
  void settle() {
    drawn([this] { WindowTest::settle(); });
  }
  void pass(std::chrono::milliseconds duration) {
    drawn([&] { WindowTest::pass(duration); });
  }
  void tap(const QString& objectName) { tap(find(objectName)); }
  void tap(QQuickItem* item) {
    drawn([&] { WindowTest::tap(item); });
  }
  void longPress(QQuickItem* item) {
    drawn([&] { WindowTest::longPress(item); });
  }
  void swipe(QQuickItem* item, int dx, int dy) {
    drawn([&] { WindowTest::swipe(item, dx, dy); });
  }
  void key(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    drawn([&] { WindowTest::key(key, modifiers); });
  }

  // What happens.
  /// Writes a row, and announces it.
  void arrives(const Metric& metric);
  void showsAllMetrics();
  void showsDashboard();
  /// Opens a row of the metric list, which is on show.
  void opens(const std::string& metricName);
  /// Every statement that writes fails while the answer lives.
  std::shared_ptr<RawDatabase> lockDatabase();
  /// The queue on which the store's statements run.
  SteppedQueue& databaseQueue();

  // What is on show.
  /// The row of that name and kind, or null.
  QQuickItem* row(const QString& objectName, const std::string& name);
  /// A property of all rows of a kind, from the top down and then from the left.
  std::vector<std::string> column(const QString& objectName, const char* property);
  QQuickItem* inRow(QQuickItem* row, const QString& objectName) { return find(objectName, row); }
  QRectF place(const QQuickItem* item) const;
  std::int64_t number(const std::string& query);

  PersistanceStore& store();
  void types(const QString& text);

 private:
  template <typename Verb>
  void drawn(Verb&& verb) {
    verb();
    if (HasFatalFailure()) return;
    window().grabWindow();
    WindowTest::settle();
  }
  std::shared_ptr<RawDatabase> openFile() const;

  ScopedTimeZone zone_{"UTC"};
  ScopedLocale locale_{"en_US"};
};

inline std::string value(QQuickItem* row) {
  return row == nullptr ? "no row" : row->property("value").toString().toStdString();
}

}  // namespace quorl::test
