#pragma once

#include <filesystem>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/Platform.h"
#include "support/SteppedQueue.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {

struct FakeDeviceProperties final : DeviceProperties {
  bool boolean(std::string_view name) override;
  std::optional<std::string> text(std::string_view name) override;
  bool hasClass(std::string_view name) override;

  std::map<std::string, bool, std::less<>> booleans;
  std::map<std::string, std::string, std::less<>> texts;
  std::vector<std::string> classes;
  std::vector<std::string> asked;  // names in the order of the queries
};

struct FakeResources final : Resources {
  std::optional<std::filesystem::path> path(std::string_view name, std::string_view type) override;
  /// By "name.type". What is not here is missing.
  std::map<std::string, std::filesystem::path, std::less<>> files;
};

struct FakeDocuments final : DocumentsDirectory {
  std::optional<std::filesystem::path> path() override { return directory; }
  std::optional<std::filesystem::path> directory;
};

struct FakeStrings final : StringTable {
  std::string localized(std::string_view key) override;
  std::map<std::string, std::string, std::less<>> table;
  StringTable* rest = nullptr;  // answers for what is not in the table
};

struct FakeConsole final : Console {
  void print(std::string_view line) override { lines.emplace_back(line); }
  std::vector<std::string> lines;
};

struct FakeAlerts final : AlertPresenter {
  void present(Alert alert) override;
  std::function<void(const Alert& alert)> onPresent;
  std::vector<Alert> shown;
};

struct FakeAnalytics final : AnalyticsSink {
  void send(std::string_view event, const Payload& payload) override;
  std::function<void(std::string_view event)> onSend;
  std::vector<std::pair<std::string, Payload>> sent;
};

struct FakeShare final : ShareFacility {
  void share(SharedText text) override {
    fileNames.push_back(text.fileName());
    texts.push_back(text.text());
  }
  std::vector<std::string> texts;
  std::vector<std::string> fileNames;
};

struct FakePasteboard final : Pasteboard {
  void setText(std::string_view value) override { text = std::string(value); }
  std::optional<std::string> text;
};

/// Records every call of the baseband client library and delivers events when a test says so.
class FakeZelkor final : public zelkor::client::Library {
 public:
  struct Command {
    std::string name;
    zelkor::KeyValueMessage message;
  };

  std::shared_ptr<zelkor::client::Manager> CreateManager(std::string_view clientName,
                                                         std::shared_ptr<Queue> queue) override;
  void RegisterEventHandler(const std::shared_ptr<zelkor::client::Manager>& manager, std::string_view event,
                            zelkor::client::EventHandler handler) override;
  void EventsOff(const std::shared_ptr<zelkor::client::Manager>& manager) override;
  void EventsOn(const std::shared_ptr<zelkor::client::Manager>& manager) override;
  zelkor::client::Result PerformCommand(const std::shared_ptr<zelkor::client::Manager>& manager,
                                        std::string_view command, const zelkor::KeyValueMessage& message,
                                        zelkor::KeyValueMessage& response) override;

  /// Queues an event on the client's queue, events on or off.
  void deliver(std::string_view event, zelkor::KeyValueMessage message);

  std::string clientName;
  std::shared_ptr<Queue> queue;
  /// Every operation in order, such as "CreateManager", "RegisterEventHandler kEventMetric", "EventsOn",
  /// "kCommandQueryMetric".
  std::vector<std::string> calls;
  /// Told of each call as it comes, for a transcript that mixes calls with log lines.
  std::function<void(const std::string& call)> onCall;
  std::vector<Command> commands;
  /// Answer by command name; success for all others.
  std::map<std::string, zelkor::client::Result, std::less<>> answers;

 private:
  void record(std::string call);

  std::map<std::string, zelkor::client::EventHandler, std::less<>> handlers_;
};

/// A telephony client with no SIM that answers nothing; tests of telephony use the simulated one.
class SilentTelephony final : public HorvaneClientFactory {
 public:
  std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) override;
  std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() override;
};

/// A whole fake platform on virtual time, installed while it lives. Before and after, all process-wide objects of the
/// product are reset. Documents go to a temporary directory.
class FakePlatform {
 public:
  /// `telephony` replaces the silent one; it must outlive this object.
  explicit FakePlatform(HorvaneClientFactory* telephony = nullptr);
  ~FakePlatform();
  FakePlatform(const FakePlatform&) = delete;
  FakePlatform& operator=(const FakePlatform&) = delete;

  VirtualTime time;
  std::shared_ptr<SteppedQueue> mainQueue;
  std::shared_ptr<SteppedQueue> backgroundQueue;
  TemporaryDirectory directory;
  FakeDeviceProperties properties;
  FakeResources resources;
  FakeDocuments documents;
  FakeStrings strings;
  FakeConsole console;
  FakeAlerts alerts;
  FakeAnalytics analytics;
  FakeShare share;
  FakePasteboard pasteboard;
  FakeZelkor zelkor;
  SilentTelephony silentTelephony;
  Platform platform;
};

/// Forgets all process-wide objects of the product: the default notification centre and the shared instances.
void resetSharedObjects();

}  // namespace quorl::test
