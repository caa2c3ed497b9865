#include "hosts/simulator/network/Subscription.h"

#include <utility>

namespace quorl::simulator::network {
namespace {

constexpr SimulatedMs kConnectedMs = 200;  // measurement period of TS 36.133 8.1.2.2
constexpr SimulatedMs kIdleMs = 1280;      // paging cycle
constexpr SimulatedMs kScreenSavingMs = 8000;

}  // namespace

Subscription::Subscription(std::uint8_t number, const Scenario& scenario, const Network& network, RadioField& field,
                           Phone& phone, std::uint64_t seed, SubscriptionCore::Outlet outlet)
    : core_(number, scenario, network, field, phone, seed, std::move(outlet)),
      camping_(core_),
      connection_(core_, camping_),
      mobility_(core_, connection_),
      carriers_(core_, connection_),
      registration_(core_, camping_, connection_),
      data_(core_, connection_),
      calls_(core_, camping_, connection_),
      health_(core_) {
  // Cells of a connection are given up before anybody asks for new ones.
  core_.users = {&mobility_, &carriers_, &health_, &registration_, &calls_, &data_};
}

void Subscription::changeMode(OperatingMode mode) {
  SubscriptionState& state = core_.state;
  const event::OperatingModeChanged changed{state.mode, core_.now() - state.modeSinceMs};
  state.mode = mode;
  state.modeSinceMs = core_.now();
  core_.emit(changed);
}

void Subscription::powerOn() {
  if (core_.state.mode == OperatingMode::Online) return;
  changeMode(OperatingMode::Online);
  if (core_.sim.isPresent && !core_.state.isSimPresent && core_.state.home == Plmn{}) insertSim();
  if (core_.state.isSimPresent) start();
}

void Subscription::powerOff(OperatingMode mode) {
  if (core_.state.mode != OperatingMode::Online) return;
  if (core_.state.isSimPresent) stop();
  changeMode(mode);
}

void Subscription::insertSim() {
  SubscriptionState& state = core_.state;
  if (state.isSimPresent || !core_.sim.isPresent) return;
  const Operator& home = core_.scenario.operators[core_.sim.operatorIndex];
  const bool isFirst = state.home == Plmn{};
  state.isSimPresent = true;
  state.home = home.plmn;
  state.carrier = home.carrier;
  // A test network's subscriber: nobody has this number.
  std::string imsi = std::to_string(1000 + home.plmn.mcc).substr(1) +
                     std::to_string(1000 + home.plmn.mnc).substr(home.plmn.mncDigits == 3 ? 1 : 2);
  imsi.append(14 - imsi.size(), '0');
  state.imsi = imsi + static_cast<char>('1' + state.subscription);
  ++core_.phone.simsPresent;
  core_.emit(event::SimChanged{true});
  if (!isFirst && state.mode == OperatingMode::Online) start();
}

void Subscription::removeSim() {
  if (!core_.state.isSimPresent) return;
  if (core_.state.mode == OperatingMode::Online) stop();
  core_.state.isSimPresent = false;
  --core_.phone.simsPresent;
  core_.emit(event::SimChanged{false});
  core_.emit(event::HealthFinding{event::HealthKind::SimError, 1});
}

void Subscription::start() {
  registration_.powerOn();
  health_.powerOn();
  calls_.powerOn();
  data_.powerOn();
  camping_.searchAfter(core_.delay(700, 1800));
  core_.after(Timer::Measure, kIdleMs);
}

void Subscription::stop() {
  calls_.drop();
  data_.drop();
  connection_.drop();
  camping_.leave();
  registration_.forget();
  health_.powerOff();
  core_.cancelAll();
}

void Subscription::screenChanged(bool isOn) {
  if (core_.state.mode != OperatingMode::Online || !core_.state.isSimPresent) return;
  if (!isOn) {
    core_.after(Timer::Saving, kScreenSavingMs);
    return;
  }
  core_.cancel(Timer::Saving);
  if (core_.state.saving.isFr1Disabled) carriers_.setSaving({false, false, SavingTrigger::ScreenStatus, 0});
}

void Subscription::measure() {
  core_.after(Timer::Measure, core_.isConnected() ? kConnectedMs : kIdleMs);
  if (core_.cell() == nullptr) return;
  core_.measure();
  SubscriptionState& state = core_.state;
  const bool isConnected = core_.isConnected();
  ++state.counters.measurements;
  if (state.technology == Technology::Lte) {
    for (std::size_t antenna = 0; antenna < state.serving->antennas; ++antenna) {
      state.counters.power[antenna].add(state.serving->antennaPower[antenna]);
      state.counters.quality[antenna].add(state.serving->antennaQuality[antenna]);
      state.counters.sinr[antenna].add(state.serving->antennaSinr[antenna]);
    }
  }
  if (isConnected) carriers_.measured();
  data_.measured();
  calls_.measured();
  core_.emit(event::Measured{isConnected});
  health_.measured();
  if (isConnected) {
    mobility_.measured();
  } else if (state.rrc != RrcState::Connecting && state.rrc != RrcState::Closing) {
    camping_.measured();
  }
}

void Subscription::runNext() {
  const Timer timer = core_.next().second;
  core_.cancel(timer);
  switch (timer) {
    case Timer::Measure:
      return measure();
    case Timer::Search:
      // A connection at hand comes first; the search follows its end.
      if (core_.state.rrc == RrcState::None || core_.state.rrc == RrcState::Idle) return camping_.search();
      return camping_.searchAfter(5000);
    case Timer::Access:
      return connection_.accessTried();
    case Timer::Setup:
      return connection_.setUp();
    case Timer::Release:
      return connection_.released();
    case Timer::Inactivity:
      return connection_.inactive();
    case Timer::HandoverCommand:
      return mobility_.commandReceived();
    case Timer::HandoverExecution:
      return mobility_.executed();
    case Timer::OutOfSync:
      return mobility_.outOfSyncTooLong();
    case Timer::Reestablish:
      return connection_.reestablishTried();
    case Timer::NrOutOfSync:
      return carriers_.groupOutOfSync();
    case Timer::GroupAddition:
      return carriers_.addGroup();
    case Timer::CarrierActivation:
      return carriers_.activateCarriers();
    case Timer::Registration:
      return registration_.answered();
    case Timer::RegistrationRetry:
      return registration_.retry();
    case Timer::PeriodicUpdate:
      return registration_.periodicUpdateDue();
    case Timer::NextSession:
      return data_.nextDue();
    case Timer::SessionEnd:
      return data_.sessionOver();
    case Timer::NextCall:
      return calls_.nextDue();
    case Timer::Call:
      return calls_.stepDue();
    case Timer::Fallback:
      return calls_.fallBackDue();
    case Timer::Tuner:
      return health_.gripChanged();
    case Timer::StallEnd:
      return data_.stallOver();
    case Timer::Saving:
      return carriers_.setSaving({true, true, SavingTrigger::ScreenStatus, 0});
    case Timer::Count:
      return;
  }
}

}  // namespace quorl::simulator::network
