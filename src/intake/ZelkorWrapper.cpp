#include "intake/ZelkorWrapper.h"

#include <array>
#include <fstream>
#include <mutex>
#include <optional>
#include <string>
#include <utility>

#include "platform/Platform.h"
#include "shell/Logs.h"

namespace quorl {
namespace {

using zelkor::KeyValueMessage;

constexpr char kClientName[] = "quorl";
constexpr std::string_view kAcceptedAppId = "quorl";
constexpr std::int64_t kAppIdOnTheChannel = 2;
constexpr std::int64_t kPayloadType = 0;
constexpr char kQueueName[] = "com.ardent.Quorlode.serialQ.queue";

// What a metric event is reduced to.
constexpr std::array kMetricKeys{zelkor::kKeyTriggerRef, zelkor::kKeyProfileID, zelkor::kKeyAppID, zelkor::kKeyMetricID,
                                 zelkor::kKeyPayload};

std::unique_ptr<ZelkorWrapper> sharedSlot;
std::shared_ptr<Queue> queueSlot;

const char* successText(const zelkor::client::Result& result) {
  return result.code == 0 ? "TRUE" : "FALSE";
}

/// The whole content of a file, or nothing when it cannot be read.
std::optional<ByteString> readFile(const std::filesystem::path& path) {
  std::ifstream file(path, std::ios::binary);
  if (!file) return std::nullopt;
  std::string content;
  std::array<char, 4096> chunk;
  do {
    file.read(chunk.data(), chunk.size());
    content.append(chunk.data(), static_cast<std::size_t>(file.gcount()));
  } while (file);
  if (file.bad()) return std::nullopt;
  return ByteString(content);
}

/// The metric id of an event, for the log.
struct MetricIdOf {
  const KeyValueMessage& message;
};

std::string logText(const MetricIdOf& id) {
  if (const auto number = id.message.integer(zelkor::kKeyMetricID)) return std::to_string(*number);
  return "(null)";
}

/// The current time of a clock in whole seconds since 1970, for the log.
struct SecondsOf {
  const Clock& clock;
};

std::string logText(const SecondsOf& seconds) {
  return std::to_string(std::chrono::floor<std::chrono::seconds>(seconds.clock.now()).time_since_epoch().count());
}

}  // namespace

/// The weak reference that handlers share with the wrapper: they may outlive it on the library's queue.
class ZelkorWrapper::DelegateSlot {
 public:
  std::shared_ptr<ZelkorWrapperDelegate> get() const {
    const std::lock_guard lock(mutex_);
    return delegate_.lock();
  }
  bool exists() const {
    const std::lock_guard lock(mutex_);
    return !delegate_.expired();
  }
  void set(std::weak_ptr<ZelkorWrapperDelegate> delegate) {
    const std::lock_guard lock(mutex_);
    delegate_ = std::move(delegate);
  }

 private:
  mutable std::mutex mutex_;
  std::weak_ptr<ZelkorWrapperDelegate> delegate_;  // guarded by mutex_
};

ZelkorWrapper& ZelkorWrapper::sharedInstance() {
  if (!sharedSlot) sharedSlot.reset(new ZelkorWrapper);
  return *sharedSlot;
}

void ZelkorWrapper::resetSharedInstance() {
  sharedSlot.reset();
  queueSlot.reset();
}

const std::shared_ptr<Queue>& ZelkorWrapper::queue() {
  if (!queueSlot) queueSlot = Platform::current().queues.makeSerialQueue(kQueueName);
  return queueSlot;
}

ZelkorWrapper::ZelkorWrapper()
    : library_(Platform::current().zelkor),
      mainQueue_(Platform::current().mainQueue),
      clock_(Platform::current().clock),
      zelkorManager_(library_.CreateManager(kClientName, queue())),
      delegate_(std::make_shared<DelegateSlot>()) {}

zelkor::client::Result ZelkorWrapper::performCommand(std::string_view operation, std::string_view command,
                                                     const KeyValueMessage& message) const {
  const std::shared_ptr<zelkor::client::Manager> manager = zelkorManager_;
  KeyValueMessage response;
  zelkor::client::Result result = library_.PerformCommand(manager, command, message, response);
  plainErrorLog.error("%s: error=%d msg=%s", operation, result.code, result.text);
  return result;
}

bool ZelkorWrapper::addVexilConfigForAppId(std::string_view appId, const std::filesystem::path& protofFilePath) {
  metricRelatedLog.log("[QuorlInternal-4] addVexilConfigForAppId begins");
  if (appId != kAcceptedAppId) return false;
  std::optional<ByteString> content = readFile(protofFilePath);
  if (!content) return false;

  KeyValueMessage message;
  message.set(zelkor::kKeyAppID, kAppIdOnTheChannel);
  message.set(zelkor::kKeyPayload, std::move(*content));
  message.set(zelkor::kKeyPayloadType, kPayloadType);
  const zelkor::client::Result result = performCommand("-[ZelkorWrapper addVexilConfigForAppId:andProtofFilePath:]",
                                                       zelkor::kCommandAddConfiguration, message);
  metricRelatedLog.log("[QuorlInternal-4] addVexilConfigForAppId success? %{public}s", successText(result));
  return result.code == 0;
}

bool ZelkorWrapper::removeVexilConfigForAppid(std::string_view appId) {
  if (appId != kAcceptedAppId) return false;

  KeyValueMessage message;
  message.set(zelkor::kKeyAppID, kAppIdOnTheChannel);
  const zelkor::client::Result result =
      performCommand("-[ZelkorWrapper removeVexilConfigForAppid:]", zelkor::kCommandClearConfiguration, message);
  metricRelatedLog.log("[QuorlInternal-4] removeVexilConfigForAppid success? %{public}s", successText(result));
  return result.code == 0;
}

bool ZelkorWrapper::querySpecificMetric(std::string_view appId, std::int32_t triggerRef, std::int32_t triggerType,
                                        std::int32_t triggerID, std::int32_t profileID, std::int32_t metricID) {
  if (appId != kAcceptedAppId) return false;

  KeyValueMessage message;
  message.set(zelkor::kKeyAppID, kAppIdOnTheChannel);
  message.set(zelkor::kKeyPayloadType, kPayloadType);
  message.set(zelkor::kKeyTriggerRef, std::int64_t{triggerRef});
  message.set(zelkor::kKeyTriggerType, std::int64_t{triggerType});
  message.set(zelkor::kKeyTriggerID, std::int64_t{triggerID});
  message.set(zelkor::kKeyProfileID, std::int64_t{profileID});
  message.set(zelkor::kKeyMetricID, std::int64_t{metricID});
  const zelkor::client::Result result =
      performCommand("-[ZelkorWrapper querySpecificMetric:triggerRef:triggerType:triggerID:profileID:metricID:]",
                     zelkor::kCommandQueryMetric, message);
  metricRelatedLog.log("[QuorlInternal-4] querySpecificMetric success? %{public}s errorCode if any %{public}d",
                       successText(result), result.code);
  return result.code == 0;
}

void ZelkorWrapper::listen() {
  const std::shared_ptr<zelkor::client::Manager> manager = zelkorManager_;

  // The delegate is looked at twice: here to spare the hop, and on the main queue since it may be gone by then.
  library_.RegisterEventHandler(
      manager, zelkor::kEventTrigger,
      [slot = delegate_, &mainQueue = mainQueue_](const KeyValueMessage& message, const zelkor::client::Group&) {
        if (!slot->exists()) return;
        mainQueue.async([slot, dictionary = message] {
          if (const auto delegate = slot->get()) delegate->eventsDidUpdate(dictionary);
        });
      });
  library_.RegisterEventHandler(manager, zelkor::kEventMetric,
                                [slot = delegate_, &mainQueue = mainQueue_, &clock = clock_](
                                    const KeyValueMessage& message, const zelkor::client::Group&) {
                                  KeyValueMessage dictionary;
                                  for (const std::string_view key : kMetricKeys)
                                    if (const zelkor::KeyValue* value = message.find(key)) dictionary.set(key, *value);
                                  metricRelatedLog.log("received - metricId %{public}@, initialTimestamp: %{public}ld",
                                                       MetricIdOf{dictionary}, SecondsOf{clock});
                                  if (!slot->exists()) return;
                                  mainQueue.async([slot, dictionary = std::move(dictionary)] {
                                    if (const auto delegate = slot->get()) delegate->metricsDidUpdate(dictionary);
                                  });
                                });
  library_.EventsOff(manager);
  library_.EventsOn(manager);
}

std::shared_ptr<ZelkorWrapperDelegate> ZelkorWrapper::delegate() const {
  return delegate_->get();
}

void ZelkorWrapper::setDelegate(std::weak_ptr<ZelkorWrapperDelegate> delegate) {
  delegate_->set(std::move(delegate));
}

}  // namespace quorl
