#pragma once

#include <chrono>
#include <cstddef>
#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "app/AppDelegate.h"
#include "app/ApplicationLoop.h"
#include "base/Log.h"
#include "base/NotificationCenter.h"
#include "faults/NasEvent.h"
#include "hosts/simulator/BasebandManager.h"
#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "shell/BaseViewController.h"
#include "store/PersistanceStore.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/PassingLibrary.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"

namespace quorl::test {

/// Counts error lines by their text, of all categories; other lines are not even rendered.
class ErrorLines final : public LogSink {
 public:
  bool isEnabled(std::string_view /*category*/, LogLevel level) const override { return level == LogLevel::Error; }
  void write(std::string_view /*category*/, LogLevel /*level*/, std::string_view text) override {
    ++counts_[std::string(text)];
    if (onLine) onLine(text);
  }

  std::size_t count(std::string_view text) const {
    const auto found = counts_.find(text);
    return found == counts_.end() ? 0 : found->second;
  }
  /// How many lines contain `part`.
  std::size_t countContaining(std::string_view part) const;
  void clear() { counts_.clear(); }

  /// Told of each line as it comes.
  std::function<void(std::string_view line)> onLine;

 private:
  std::map<std::string, std::size_t, std::less<>> counts_;
};

/// A baseband manager that can be told to refuse, to be slow, and to fall silent.
class UnwillingManager final : public PassingLibrary {
 public:
  using PassingLibrary::PassingLibrary;

  zelkor::client::Result PerformCommand(const std::shared_ptr<zelkor::client::Manager>& manager,
                                        std::string_view command, const zelkor::KeyValueMessage& message,
                                        zelkor::KeyValueMessage& response) override {
    ++commands[std::string(command)];
    if (duringCommand) duringCommand();
    if (refusal) return *refusal;
    return PassingLibrary::PerformCommand(manager, command, message, response);
  }

  std::optional<zelkor::client::Result> refusal;  // the answer to every command, none of which is carried out
  std::function<void()> duringCommand;
  std::map<std::string, int, std::less<>> commands;
};

/// The whole product, started as a host starts it, on a phone whose parts a test can break: a real database file,
/// baseband manager and log capture of the simulated phone, virtual time. The clock, SQLite's included, begins at
/// 2026-01-05 09:30:12 UTC.
class BreakablePhone {
 public:
  explicit BreakablePhone(HorvaneClientFactory* telephony = nullptr);
  ~BreakablePhone();
  BreakablePhone(const BreakablePhone&) = delete;
  BreakablePhone& operator=(const BreakablePhone&) = delete;

  /// Starts the product and lets it come to rest. It does not wait for the disk at each row, so that tests take less.
  void launch();
  /// Stores a metric, pins two of its attributes and opens the dashboard, whose timer then runs.
  void showsDashboard();
  /// The process is gone, and with it all that was in memory.
  void ends();
  void becomesActive();
  void passes(std::chrono::nanoseconds duration) { host.time.advance(duration); }

  /// Metrics come in, one second of the clock each if `step` says nothing else, and are handled.
  void metricsArrive(std::size_t count, std::chrono::milliseconds step = std::chrono::seconds(1));
  void metricArrives(const zelkor::KeyValueMessage& event);
  /// Delivers without letting the product do anything yet. False when the product does not listen.
  bool deliver(const zelkor::KeyValueMessage& event) { return manager.deliver(zelkor::kEventMetric, event); }

  BaseViewController& screens() { return *application->window()->rootViewController()->rootScreen(); }
  PersistanceStore& store() { return *application->window()->rootViewController()->persistanceStore(); }

  std::filesystem::path file() const { return *host.documents.directory / "metricPartV11.sqlite"; }
  /// What is wrong with the database file; "ok" if nothing is.
  std::string integrity() const { return RawDatabase(file()).column("PRAGMA integrity_check").at(0); }
  std::size_t storedRows() const;
  /// Rows whose insert failed, as the log tells it.
  std::size_t lostRows() const { return errors->countContaining("error occurred while inserting"); }

  FakePlatform host;
  VirtualTimeVfs vfs{host.time};
  std::optional<ScopedTimeZone> zone{std::in_place, "UTC"};
  simulator::ResourceDirectories resources{{QUORL_SOURCE_DIR "/resources"}};
  simulator::BasebandManager manager;
  UnwillingManager library{manager};
  simulator::SondrelSimulator capture;
  std::shared_ptr<ErrorLines> errors = std::make_shared<ErrorLines>();
  std::size_t reportedRows = 0;  // told by the product as stored, over all its lives
  std::unique_ptr<AppDelegate> application;

 private:
  Platform platform_;
  std::shared_ptr<LogSink> previousLog_;
  NotificationCenter::Observation observation_;
};

/// Prints a figure of the test at hand, for docs/reliability.md.
void figure(std::string_view what, std::size_t value);

/// What a file holds.
std::string contentOf(const std::filesystem::path& file);

}  // namespace quorl::test
