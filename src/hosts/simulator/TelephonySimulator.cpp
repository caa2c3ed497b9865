#include "hosts/simulator/TelephonySimulator.h"

#include <array>
#include <functional>
#include <map>
#include <mutex>

#include "telephony/CarrierInfoObject.h"

namespace quorl::simulator {
namespace {

constexpr HVSubscriptionSlot kSlots[] = {1, 2};

template <typename... Handlers>
struct Overloaded : Handlers... {
  using Handlers::operator()...;
};
template <typename... Handlers>
Overloaded(Handlers...) -> Overloaded<Handlers...>;

struct Slot {
  bool isSimPresent = false;
  std::optional<std::string> carrierName;
  HVCellInfo cell;
  std::optional<std::int64_t> rsrp;  // dBm
  HVBandInfo bands;
  std::optional<HVError> cellError;
  std::optional<HVError> signalError;
  std::optional<HVError> bandsError;
};

std::string describe(const std::optional<std::int64_t>& rsrp) {
  return rsrp ? "rsrp: " + std::to_string(*rsrp) + " dBm" : "no rsrp";
}

/// What outlives a client's handle only while a delegate call is being delivered.
class ClientCore {
 public:
  explicit ClientCore(Queue& queue) : queue_(queue) {}

  Queue& queue() { return queue_; }

  void setDelegate(std::weak_ptr<HorvaneClientDelegate> delegate) {
    const std::lock_guard lock(mutex_);
    delegate_ = std::move(delegate);
  }
  std::shared_ptr<HorvaneClientDelegate> delegate() {
    const std::lock_guard lock(mutex_);
    return delegate_.lock();
  }

 private:
  Queue& queue_;
  std::mutex mutex_;
  std::weak_ptr<HorvaneClientDelegate> delegate_;  // guarded by mutex_
};

}  // namespace

struct TelephonySimulator::State {
  explicit State(std::shared_ptr<Queue> queue) : worker(std::move(queue)) {}

  /// Null for a slot that the phone does not have.
  Slot* slot(HVSubscriptionSlot number) { return number == 1 || number == 2 ? &slots[number == 2 ? 1U : 0U] : nullptr; }

  /// Queues `call` for every client's delegate. `mutex` is held.
  void tell(const std::function<void(HorvaneClientDelegate&)>& call) {
    std::erase_if(clients, [](const auto& client) { return client.expired(); });
    for (const std::weak_ptr<ClientCore>& weak : clients) {
      const auto client = weak.lock();
      if (!client) continue;
      client->queue().async([weak, call] {
        const auto core = weak.lock();
        const auto delegate = core ? core->delegate() : nullptr;
        if (delegate) call(*delegate);
      });
    }
  }

  void tellOfCell(HVSubscriptionSlot number, const Slot& changed) {
    tell([context = HVServiceSubscriptionContext(number, changed.isSimPresent),
          info = changed.cell](HorvaneClientDelegate& delegate) { delegate.cellMonitorUpdate(context, info); });
  }

  void answer(Queue::Task task) {
    if (delay == std::chrono::milliseconds::zero()) {
      worker->async(std::move(task));
    } else {
      worker->asyncAfter(delay, std::move(task));
    }
  }

  void perform(const telephony_event::Event& event);

  const std::shared_ptr<Queue> worker;
  std::mutex mutex;
  // Guarded by mutex.
  std::array<Slot, 2> slots;
  std::chrono::milliseconds delay{0};
  bool hasCarrierMap = true;
  std::optional<HVError> subscriptionsError;
  std::vector<std::weak_ptr<ClientCore>> clients;
  bool isPhoneGone = false;  // while clients live on
};

void TelephonySimulator::State::perform(const telephony_event::Event& event) {
  namespace step = telephony_event;
  std::visit(Overloaded{
                 [&](const step::SimInserted& sim) {
                   Slot* changed = slot(sim.slot);
                   if (changed == nullptr) return;
                   changed->isSimPresent = true;
                   changed->carrierName = sim.carrier;
                   tellOfCell(sim.slot, *changed);
                 },
                 [&](const step::SimRemoved& sim) {
                   Slot* changed = slot(sim.slot);
                   if (changed == nullptr) return;
                   // The radio of the slot goes with its SIM; what fails goes on failing.
                   changed->isSimPresent = false;
                   changed->carrierName.reset();
                   changed->cell = {};
                   changed->rsrp.reset();
                   tellOfCell(sim.slot, *changed);
                 },
                 [&](const step::CarrierName& carrier) {
                   if (Slot* changed = slot(carrier.slot)) changed->carrierName = carrier.name;
                 },
                 [&](const step::CarrierMap& map) { hasCarrierMap = map.isPresent; },
                 [&](const step::Cell& cell) {
                   Slot* changed = slot(cell.slot);
                   if (changed == nullptr) return;
                   changed->cell = cell.info;
                   if (cell.isUpdate) tellOfCell(cell.slot, *changed);
                 },
                 [&](const step::Signal& signal) {
                   if (Slot* changed = slot(signal.slot)) changed->rsrp = signal.rsrp;
                 },
                 [&](const step::Bands& bands) {
                   if (Slot* changed = slot(bands.slot)) changed->bands = bands.bands;
                 },
                 [&](const step::Failure& failure) {
                   Slot* changed = slot(failure.slot);
                   switch (failure.what) {
                     case step::Service::Subscriptions:
                       subscriptionsError = failure.error;
                       return;
                     case step::Service::Cell:
                       if (changed != nullptr) changed->cellError = failure.error;
                       return;
                     case step::Service::Signal:
                       if (changed != nullptr) changed->signalError = failure.error;
                       return;
                     case step::Service::Bands:
                       if (changed != nullptr) changed->bandsError = failure.error;
                       return;
                   }
                 },
                 [&](const step::Connection& connection) {
                   const Slot* changed = slot(connection.slot);
                   if (changed == nullptr) return;
                   tell([context = HVServiceSubscriptionContext(connection.slot, changed->isSimPresent),
                         type = connection.type, status = connection.status](HorvaneClientDelegate& delegate) {
                     delegate.connectionStateChanged(context, type, status);
                   });
                 },
             },
             event);
}

class TelephonySimulator::Client final : public HorvaneClient {
 public:
  Client(std::shared_ptr<State> state, std::shared_ptr<ClientCore> core)
      : state_(std::move(state)), core_(std::move(core)) {}

  void setDelegate(std::weak_ptr<HorvaneClientDelegate> delegate) override { core_->setDelegate(std::move(delegate)); }

  void getSubscriptionInfo(
      std::function<void(std::optional<HVServiceSubscriptionInfo>, std::optional<HVError>)> completion) override {
    const std::lock_guard lock(state_->mutex);
    std::optional<HVServiceSubscriptionInfo> info;
    const std::optional<HVError> error = state_->subscriptionsError;
    if (!error) {
      auto& subscriptions = info.emplace().subscriptions.emplace();
      for (const HVSubscriptionSlot number : kSlots)
        subscriptions.emplace_back(number, state_->slot(number)->isSimPresent);
    }
    core_->queue().async([completion = std::move(completion), info, error] { completion(info, error); });
  }

  void copyCellInfo(const HVServiceSubscriptionContext& context,
                    std::function<void(std::optional<HVCellInfo>, std::optional<HVError>)> completion) override {
    const std::lock_guard lock(state_->mutex);
    const Slot* slot = state_->slot(context.slotID());
    std::optional<HVCellInfo> info;
    std::optional<HVError> error = slot != nullptr ? slot->cellError : noSuchSlot();
    if (!error) info = slot->cell;
    state_->answer([completion = std::move(completion), info = std::move(info), error = std::move(error)] {
      completion(info, error);
    });
  }

  void getSignalStrengthMeasurements(
      const HVServiceDescriptor& descriptor,
      std::function<void(std::optional<HVSignalStrengthMeasurements>, std::optional<HVError>)> completion) override {
    const std::lock_guard lock(state_->mutex);
    const Slot* slot = state_->slot(descriptor.context().slotID());
    std::optional<HVSignalStrengthMeasurements> measurements;
    std::optional<HVError> error = slot != nullptr ? slot->signalError : noSuchSlot();
    if (!error) measurements = HVSignalStrengthMeasurements{slot->rsrp, describe(slot->rsrp)};
    state_->answer([completion = std::move(completion), measurements = std::move(measurements),
                    error = std::move(error)] { completion(measurements, error); });
  }

  std::optional<HVBandInfo> getBandInfo(const HVServiceSubscriptionContext& context,
                                        std::optional<HVError>& error) override {
    const std::lock_guard lock(state_->mutex);
    const Slot* slot = state_->slot(context.slotID());
    error = slot != nullptr ? slot->bandsError : noSuchSlot();
    if (error) return std::nullopt;
    return slot->bands;
  }

 private:
  static std::optional<HVError> noSuchSlot() { return HVError{"no such slot"}; }

  const std::shared_ptr<State> state_;
  const std::shared_ptr<ClientCore> core_;
};

class TelephonySimulator::NetworkInfo final : public HVTelephonyNetworkInfo {
 public:
  explicit NetworkInfo(std::shared_ptr<State> state) : state_(std::move(state)) {}

  std::optional<std::map<std::string, HVCarrier>> subscriberProviders() override {
    const std::lock_guard lock(state_->mutex);
    if (!state_->hasCarrierMap) return std::nullopt;
    std::map<std::string, HVCarrier> providers;
    for (const HVSubscriptionSlot number : kSlots) {
      const Slot* slot = state_->slot(number);
      if (slot->isSimPresent) providers.emplace(simSlotKeyForSlot(number), HVCarrier{slot->carrierName});
    }
    return providers;
  }

 private:
  const std::shared_ptr<State> state_;
};

TelephonySimulator::TelephonySimulator(QueueFactory& queues)
    : state_(std::make_shared<State>(queues.makeSerialQueue("simulated telephony"))) {}

TelephonySimulator::~TelephonySimulator() {
  const std::lock_guard lock(state_->mutex);
  state_->isPhoneGone = true;
}

std::unique_ptr<HorvaneClient> TelephonySimulator::initWithQueue(Queue& queue) {
  auto core = std::make_shared<ClientCore>(queue);
  const std::lock_guard lock(state_->mutex);
  state_->clients.push_back(core);
  return std::make_unique<Client>(state_, std::move(core));
}

std::unique_ptr<HVTelephonyNetworkInfo> TelephonySimulator::networkInfo() {
  return std::make_unique<NetworkInfo>(state_);
}

void TelephonySimulator::setAnswerDelay(std::chrono::milliseconds delay) {
  const std::lock_guard lock(state_->mutex);
  state_->delay = delay;
}

void TelephonySimulator::perform(const telephony_event::Event& event) {
  const std::lock_guard lock(state_->mutex);
  state_->perform(event);
}

void TelephonySimulator::play(std::vector<TelephonyScriptStep> steps, Queue& queue) {
  std::map<std::chrono::milliseconds, std::vector<telephony_event::Event>> byTime;
  for (TelephonyScriptStep& step : steps) byTime[step.at].push_back(std::move(step.event));
  for (auto& [at, events] : byTime) {
    if (at == std::chrono::milliseconds::zero()) {
      for (const telephony_event::Event& event : events) perform(event);
      continue;
    }
    queue.asyncAfter(at, [weak = std::weak_ptr(state_), events = std::move(events)] {
      const auto state = weak.lock();
      if (!state) return;
      const std::lock_guard lock(state->mutex);
      if (state->isPhoneGone) return;
      for (const telephony_event::Event& event : events) state->perform(event);
    });
  }
}

}  // namespace quorl::simulator
