#include "hosts/simulator/BasebandManager.h"

#include <algorithm>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <utility>

#include <fmt/format.h>

#include "hosts/simulator/Configuration.h"

namespace quorl::simulator {

namespace client = zelkor::client;

namespace {

constexpr std::int64_t kProtofPayload = 0;
constexpr std::int64_t kAllMetrics = 0;

enum class ValueType { Integer, Bytes };

struct KeyRule {
  std::string_view key;
  ValueType type;
};

constexpr KeyRule kAddConfigurationKeys[] = {{zelkor::kKeyAppID, ValueType::Integer},
                                             {zelkor::kKeyPayload, ValueType::Bytes},
                                             {zelkor::kKeyPayloadType, ValueType::Integer}};
constexpr KeyRule kClearConfigurationKeys[] = {{zelkor::kKeyAppID, ValueType::Integer}};
constexpr KeyRule kQueryMetricKeys[] = {
    {zelkor::kKeyAppID, ValueType::Integer},      {zelkor::kKeyPayloadType, ValueType::Integer},
    {zelkor::kKeyTriggerRef, ValueType::Integer}, {zelkor::kKeyTriggerType, ValueType::Integer},
    {zelkor::kKeyTriggerID, ValueType::Integer},  {zelkor::kKeyProfileID, ValueType::Integer},
    {zelkor::kKeyMetricID, ValueType::Integer}};

client::Result answer(CommandCode code, std::string text) {
  return {static_cast<int>(code), std::move(text)};
}

bool hasType(const zelkor::KeyValue& value, ValueType type) {
  return type == ValueType::Integer ? std::holds_alternative<std::int64_t>(value)
                                    : std::holds_alternative<ByteString>(value);
}

template <std::size_t N>
std::optional<client::Result> keyFault(const zelkor::KeyValueMessage& message, const KeyRule (&rules)[N]) {
  for (const KeyRule& rule : rules) {
    const zelkor::KeyValue* value = message.find(rule.key);
    if (value == nullptr) return answer(CommandCode::MissingKey, fmt::format("{} is missing", rule.key));
    if (!hasType(*value, rule.type)) {
      return answer(CommandCode::WrongType,
                    fmt::format("{} is no {}", rule.key, rule.type == ValueType::Integer ? "integer" : "byte string"));
    }
  }
  for (const auto& [key, value] : message.entries()) {
    const bool isKnown =
        std::any_of(std::begin(rules), std::end(rules), [&key = key](const KeyRule& rule) { return rule.key == key; });
    if (!isKnown) return answer(CommandCode::UnexpectedKey, fmt::format("{} does not belong here", key));
  }
  return std::nullopt;
}

/// What is wrong with a command apart from the state it meets.
std::optional<client::Result> messageFault(std::string_view command, const zelkor::KeyValueMessage& message) {
  std::optional<client::Result> fault;
  if (command == zelkor::kCommandAddConfiguration) {
    fault = keyFault(message, kAddConfigurationKeys);
  } else if (command == zelkor::kCommandClearConfiguration) {
    fault = keyFault(message, kClearConfigurationKeys);
  } else if (command == zelkor::kCommandQueryMetric) {
    fault = keyFault(message, kQueryMetricKeys);
  } else {
    fault = answer(CommandCode::UnknownCommand, fmt::format("there is no command {}", command));
  }
  if (fault) return fault;

  if (const auto appId = message.integer(zelkor::kKeyAppID); appId != Configuration::kApplicationId)
    return answer(CommandCode::UnknownApplication, fmt::format("there is no application {}", *appId));
  if (const auto type = message.integer(zelkor::kKeyPayloadType); type && type != kProtofPayload)
    return answer(CommandCode::UnknownPayloadType, fmt::format("there is no payload type {}", *type));
  return std::nullopt;
}

/// What is wrong with a query of a client with this configuration.
std::optional<client::Result> queryFault(const Configuration& configuration, const zelkor::KeyValueMessage& query) {
  const Configuration::Trigger trigger{*query.integer(zelkor::kKeyTriggerID), *query.integer(zelkor::kKeyTriggerType),
                                       *query.integer(zelkor::kKeyTriggerRef)};
  const auto& listed = configuration.triggers;
  if (std::find(listed.begin(), listed.end(), trigger) == listed.end()) {
    return answer(CommandCode::UnknownTrigger, fmt::format("the configuration lists no trigger {} of type {} and "
                                                           "reference {}",
                                                           trigger.id, trigger.type, trigger.ref));
  }
  if (const auto profile = query.integer(zelkor::kKeyProfileID); profile != configuration.profileId)
    return answer(CommandCode::UnknownTrigger, fmt::format("the configuration is not for profile {}", *profile));
  if (const auto metric = query.integer(zelkor::kKeyMetricID); metric != kAllMetrics && !configuration.selects(*metric))
    return answer(CommandCode::UnselectedMetric, fmt::format("the configuration lists no metric {}", *metric));
  return std::nullopt;
}

}  // namespace

/// One client's registration. Its mutex is held while a handler runs, hence recursive: a handler may call the library.
class BasebandManager::Client final : public client::Manager, public std::enable_shared_from_this<Client> {
 public:
  explicit Client(std::shared_ptr<Queue> queue) : queue_(std::move(queue)) {}

  void setHandler(std::string_view event, client::EventHandler handler) {
    const std::lock_guard lock(mutex_);
    handlers_.insert_or_assign(std::string(event), std::move(handler));
  }

  void setEventsOn(bool isOn) {
    const std::lock_guard lock(mutex_);
    eventsOn_ = isOn;
  }

  client::Result addConfiguration(const zelkor::KeyValueMessage& message) {
    auto parsed = parseConfiguration(message.bytes(zelkor::kKeyPayload)->view());
    if (!parsed) return answer(parsed.error().code, std::move(parsed.error().text));
    const std::lock_guard lock(mutex_);
    configuration_ = *std::move(parsed);
    return answer(CommandCode::Success, "success");
  }

  void clearConfiguration() {
    const std::lock_guard lock(mutex_);
    configuration_.reset();
    ++withdrawals_;
  }

  /// What the query asks for, or why it asks in vain.
  tl::expected<SnapshotRequest, client::Result> query(const zelkor::KeyValueMessage& message) {
    const std::lock_guard lock(mutex_);
    if (!configuration_) return tl::unexpected(answer(CommandCode::MissingConfiguration, "no configuration is added"));
    if (auto fault = queryFault(*configuration_, message)) return tl::unexpected(*std::move(fault));
    SnapshotRequest request;
    const std::int64_t metric = *message.integer(zelkor::kKeyMetricID);
    request.metrics = metric == kAllMetrics ? configuration_->metrics : std::vector{metric};
    request.triggerRef = *message.integer(zelkor::kKeyTriggerRef);
    request.deliver = [weak = weak_from_this(), asOf = withdrawals_](const zelkor::KeyValueMessage& metricMessage) {
      const auto self = weak.lock();
      return self != nullptr && self->enqueueAsOf(asOf, metricMessage);
    };
    return request;
  }

  bool enqueue(std::string_view event, const zelkor::KeyValueMessage& message) {
    const std::lock_guard lock(mutex_);
    if (!eventsOn_ || !configuration_ || !handlers_.contains(event)) return false;
    queue_->async([self = shared_from_this(), name = std::string(event), message, asOf = withdrawals_] {
      self->handle(name, message, asOf);
    });
    return true;
  }

  bool enqueueSelected(const zelkor::KeyValueMessage& message) {
    const auto metricId = message.integer(zelkor::kKeyMetricID);
    const std::lock_guard lock(mutex_);
    if (!metricId || !configuration_ || !configuration_->selects(*metricId)) return false;
    return enqueue(zelkor::kEventMetric, message);
  }

  bool enqueueAsOf(std::uint64_t withdrawals, const zelkor::KeyValueMessage& message) {
    const std::lock_guard lock(mutex_);
    return withdrawals == withdrawals_ && enqueue(zelkor::kEventMetric, message);
  }

 private:
  void handle(const std::string& event, const zelkor::KeyValueMessage& message, std::uint64_t asOf) {
    const std::lock_guard lock(mutex_);
    if (!eventsOn_ || !configuration_ || asOf != withdrawals_) return;
    // A copy: the handler may register another one in its place.
    const client::EventHandler handler = handlers_.find(event)->second;
    if (handler) handler(message, client::Group{});
  }

  const std::shared_ptr<Queue> queue_;
  std::recursive_mutex mutex_;
  // Guarded by mutex_.
  std::map<std::string, client::EventHandler, std::less<>> handlers_;
  std::optional<Configuration> configuration_;
  std::uint64_t withdrawals_ = 0;  // an event still queued when its configuration is cleared belongs to nobody
  bool eventsOn_ = false;
};

std::shared_ptr<client::Manager> BasebandManager::CreateManager(std::string_view /*clientName*/,
                                                                std::shared_ptr<Queue> queue) {
  auto made = std::make_shared<Client>(std::move(queue));
  const std::lock_guard lock(mutex_);
  std::erase_if(clients_, [](const std::weak_ptr<Client>& old) { return old.expired(); });
  clients_.push_back(made);
  return made;
}

void BasebandManager::RegisterEventHandler(const std::shared_ptr<client::Manager>& manager, std::string_view event,
                                           client::EventHandler handler) {
  if (auto* own = dynamic_cast<Client*>(manager.get())) own->setHandler(event, std::move(handler));
}

void BasebandManager::EventsOff(const std::shared_ptr<client::Manager>& manager) {
  if (auto* own = dynamic_cast<Client*>(manager.get())) own->setEventsOn(false);
}

void BasebandManager::EventsOn(const std::shared_ptr<client::Manager>& manager) {
  if (auto* own = dynamic_cast<Client*>(manager.get())) own->setEventsOn(true);
}

client::Result BasebandManager::PerformCommand(const std::shared_ptr<client::Manager>& manager,
                                               std::string_view command, const zelkor::KeyValueMessage& message,
                                               zelkor::KeyValueMessage& /*response*/) {
  auto* own = dynamic_cast<Client*>(manager.get());
  if (own == nullptr) return answer(CommandCode::ForeignManager, "the manager handle is not one of this library");
  if (auto fault = messageFault(command, message)) return *std::move(fault);
  if (command == zelkor::kCommandAddConfiguration) return own->addConfiguration(message);
  if (command == zelkor::kCommandClearConfiguration) {
    own->clearConfiguration();
    return answer(CommandCode::Success, "success");
  }
  auto request = own->query(message);
  if (!request) return std::move(request.error());
  std::function<void(SnapshotRequest)> source;
  {
    const std::lock_guard lock(mutex_);
    source = snapshotSource_;
  }
  if (source) source(*std::move(request));
  return answer(CommandCode::Success, "success");
}

void BasebandManager::setSnapshotSource(std::function<void(SnapshotRequest request)> source) {
  const std::lock_guard lock(mutex_);
  snapshotSource_ = std::move(source);
}

std::vector<std::shared_ptr<BasebandManager::Client>> BasebandManager::liveClients() {
  std::vector<std::shared_ptr<Client>> clients;
  const std::lock_guard lock(mutex_);
  for (const std::weak_ptr<Client>& registered : clients_)
    if (auto live = registered.lock()) clients.push_back(std::move(live));
  return clients;
}

bool BasebandManager::deliver(std::string_view event, const zelkor::KeyValueMessage& message) {
  bool isTaken = false;
  for (const std::shared_ptr<Client>& each : liveClients()) isTaken = each->enqueue(event, message) || isTaken;
  return isTaken;
}

bool BasebandManager::deliverSelected(const zelkor::KeyValueMessage& message) {
  bool isTaken = false;
  for (const std::shared_ptr<Client>& each : liveClients()) isTaken = each->enqueueSelected(message) || isTaken;
  return isTaken;
}

}  // namespace quorl::simulator
