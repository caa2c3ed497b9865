#pragma once

#include <QObject>
#include <QQmlComponent>
#include <QVariantMap>
#include <memory>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "store/PersistanceStore.h"
#include "support/TimeZone.h"
#include "support/window/WindowFixture.h"

namespace quorl::test {

/// A phone in UTC and American English whose screens are looked at, with rows that arrive as from the channel.
class ScreenWindowTest : public WindowTest {
 protected:
  ScreenWindowTest();

  PersistanceStore& store();
  /// A reading taken now.
  Metric reading(std::string metricTech, std::string metricName, std::string attributeName, std::string value,
                 std::int32_t subsId = 0) const;
  /// Writes a row.
  void stored(const Metric& metric);
  /// The same, and announces it.
  void arrives(const Metric& metric);

  /// Saves what the window shows to a file of that name, where a folder for pictures is given.
  void picture(const std::string& name);

  ScopedTimeZone zone_{"UTC"};
  ScopedLocale locale_{"en_US"};
};

}  // namespace quorl::test
