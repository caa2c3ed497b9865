#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "hosts/simulator/network/Cell.h"

// Everything that a modem knows of one subscription at one moment. Enumerations are the simulator's own: whoever makes
// messages of them maps them to a message's numbering, of which there are several for the same thing.

namespace quorl::simulator::network {

/// RRC states over all technologies. LTE uses those up to `Closing`, UMTS the Cell… and `UraPch`, NR `Idle`,
/// `Inactive`, `Connecting` and `Connected`, GSM `Idle` and `Connected` (dedicated).
enum class RrcState : std::uint8_t {
  None,  // not camped on this technology
  Idle,
  Connecting,
  Connected,
  Closing,
  Inactive,  // NR
  CellFach,
  CellDch,
  CellPch,
  UraPch,
};
inline constexpr std::size_t kRrcStates = 10;

/// A connection stands that carries signalling and data.
constexpr bool isConnectedState(RrcState state) {
  return state == RrcState::Connected || state == RrcState::CellDch || state == RrcState::CellFach;
}

/// Why a connection was set up, re-established or ended; a subset of TS 36.331 and TS 25.331.
enum class RrcCause : std::uint8_t {
  None,
  MoData,
  MoSignalling,
  MtAccess,
  MoVoice,
  Emergency,
  Registration,
  InterRatReselection,
  HandoverIn,           // arrived by a handover from another technology
  ReestablishLink,      // after T310
  ReestablishHandover,  // after a failed handover
  ReleaseInactivity,
  ReleaseNormal,
  ReleaseRedirection,  // fall back for a call
  ReleaseHandoverOut,  // left by a handover to another technology
  ReleaseLinkFailure,  // T310 or T311 ran out
  SetupNoResponse,     // T300 ran out
  SetupRejected,
  NoService,
};

enum class ServiceStatus : std::uint8_t { None, NoService, Limited, Service, PowerSave };
enum class ServiceDomain : std::uint8_t { None, CsOnly, PsOnly, CsPs, Camped };
enum class RoamStatus : std::uint8_t { Off, On };
enum class OperatingMode : std::uint8_t { PowerOff, Online, LowPower };

enum class RegistrationState : std::uint8_t { NotRegistered, InProgress, Registered, Denied, Limited };
enum class RegistrationProcedure : std::uint8_t {
  None,
  Attach,
  CombinedAttach,
  AreaUpdate,          // tracking, routing or location area
  CombinedAreaUpdate,  // with the circuit-switched domain
  PeriodicUpdate,
  ServiceRequest,
};

struct RegistrationContext {
  RegistrationState state = RegistrationState::NotRegistered;
  RegistrationProcedure procedure = RegistrationProcedure::None;  // the last
  std::uint8_t rejectCause = 0;                                   // TS 24.301 9.9.3.9, 0 for none
  Plmn plmn;                                                      // the registered one
  std::uint32_t areaCode = 0;                                     // of the last successful update
  std::vector<std::uint32_t> areas;                               // LTE and NR: the tracking area list
  std::uint32_t temporaryId = 0;           // M-TMSI, P-TMSI; changes at attach and area update. Invented.
  std::uint32_t circuitTemporaryId = 0;    // TMSI
  std::uint16_t groupId = 0;               // MMEGI
  std::uint8_t code = 0;                   // MMEC
  std::uint32_t periodicTimerSeconds = 0;  // T3412, T3312 or T3212
  bool isImsVoiceSupported = false;
  bool isEmergencySupported = false;
  bool isImsRegistered = false;
};

enum class CallKind : std::uint8_t { VoLte, VoNr, CircuitSwitched, FallenBack };
enum class CallPhase : std::uint8_t { None, Setup, Alerting, Conversation };
enum class CallEnd : std::uint8_t {
  LocalHangUp,
  RemoteHangUp,
  Cancelled,    // before it was answered
  NoAnswer,     // timed out while ringing
  SetupFailed,  // no access, or rejected
  Dropped,      // radio link failure
  FallbackFailed,
};

/// The call at hand, or the one that ended last.
struct Call {
  std::uint32_t id = 0;  // counts up through the run
  CallKind kind = CallKind::VoLte;
  CallPhase phase = CallPhase::None;
  bool isOutgoing = true;
  bool isFallback = false;          // fell back to UMTS or GSM at its set-up
  bool wasHandedToCircuit = false;  // single radio voice call continuity, TS 23.216
  Technology setupTechnology = Technology::None;
  Technology technology = Technology::None;  // now, or at its end
  const Cell* cell = nullptr;                // now, or at its end
  SimulatedMs startedMs = 0;                 // dialled, or paged
  std::optional<SimulatedMs> fallbackMs;     // fall back ordered
  std::optional<SimulatedMs> setupMs;        // set up in the network
  std::optional<SimulatedMs> alertedMs;
  std::optional<SimulatedMs> connectedMs;
  std::optional<SimulatedMs> endedMs;
  CallEnd end = CallEnd::LocalHangUp;
  std::uint8_t releaseCause = 0;  // TS 24.008 10.5.4.11; 16 is normal
  Centi lastPower = 0;            // at the end
  Centi lastQuality = 0;
  Centi lastRssi = 0;
  Centi lastTransmitPower = 0;
  std::uint32_t handovers = 0;
  std::uint32_t speechPacketsReceived = 0;
  std::uint32_t silencePacketsReceived = 0;
  std::uint32_t packetsLost = 0;
};

enum class MotionState : std::uint8_t { Stationary, Pedestrian, Driving };

enum class CarrierState : std::uint8_t { Deconfigured, Configured, Activated };

/// A secondary carrier of LTE carrier aggregation.
struct SecondaryCarrier {
  std::uint8_t index = 0;  // from 1
  CarrierState state = CarrierState::Deconfigured;
  ServingMeasurement serving;
  bool hasUplink = false;
};

/// The NR secondary cell group of EN-DC.
struct SecondaryGroup {
  ServingMeasurement serving;
  SimulatedMs addedMs = 0;
  std::uint32_t beamSwitches = 0;
  std::uint32_t beamFailures = 0;
  std::uint32_t beamRecoveries = 0;
  std::uint64_t masterBytes = 0;  // since it was added
  std::uint64_t secondaryBytes = 0;
};

/// What was used of a connection so far.
struct ConnectionUse {
  SimulatedMs sinceMs = 0;
  Modulation maxDownlink = Modulation::Qpsk;
  Modulation maxUplink = Modulation::Qpsk;
  std::uint8_t maxRank = 1;
  std::uint8_t maxLayersScheduled = 1;
  std::uint8_t maxCarriers = 1;
  std::uint8_t maxTotalLayers = 1;
  bool hadSecondaryGroup = false;
};

/// Connected-mode DRX, and the paging cycle.
struct DrxConfiguration {
  bool isConnectedDrx = false;
  std::uint16_t onDurationMs = 0;
  std::uint16_t inactivityMs = 0;
  std::uint16_t retransmissionMs = 0;
  std::uint16_t longCycleMs = 0;
  std::uint16_t shortCycleMs = 0;
  std::uint8_t shortCycles = 0;
  std::uint16_t pagingCycleMs = 0;
};

/// Parameters of cell selection and reselection that the serving cell broadcasts, in whole dB (TS 36.304 5.2.4,
/// TS 25.304 5.2.6).
struct ReselectionParameters {
  std::int16_t qRxLevMin = 0;   // dBm
  std::int16_t qQualMin = 0;    // dB
  std::int16_t hysteresis = 0;  // Qhyst
  std::int16_t intraSearch = 0;
  std::int16_t nonIntraSearch = 0;
  std::int16_t servingLow = 0;
  std::int16_t higherThreshold = 0;  // ThreshX,High
  std::int16_t lowerThreshold = 0;   // ThreshX,Low
  std::uint8_t reselectionSeconds = 0;
};

struct Bearer {
  std::uint8_t id = 5;  // EPS bearer identity, or NSAPI
  std::string accessPoint;
  std::array<std::uint8_t, 4> address{};  // of the documentation range
  bool isIms = false;
};

enum class LinkQuality : std::uint8_t { Unknown, Bad, Poor, Good };

/// Position of the hands and state of the antenna tuner.
struct TunerState {
  Technology technology = Technology::None;
  std::uint16_t band = 0;
  std::uint8_t scenario = 0;  // 0 to 13: free space, hands, head, …
  std::uint8_t antenna = 0;   // 0 to 3
  std::uint16_t vswrMagnitude = 0;
  std::uint16_t vswrPhase = 0;  // degrees
  bool hasAccessory = false;
};

/// Which NR frequency ranges are not measured to save power, and why.
enum class SavingTrigger : std::uint8_t { None, Sleep, CellularData, VoiceCall, DataStall, ScreenStatus, Setting };
struct NrSaving {
  bool isFr1Disabled = false;
  bool isFr2Disabled = false;
  SavingTrigger trigger = SavingTrigger::None;
  SimulatedMs sinceMs = 0;
};

/// A histogram since the start of the run. Bin 0 takes everything below its upper edge, the last everything above.
template <std::size_t Bins, Centi Lowest, Centi Width>
struct Histogram {
  static constexpr Centi kLowest = Lowest;
  static constexpr Centi kWidth = Width;
  std::array<std::uint64_t, Bins> bins{};

  void add(Centi value) {
    const Centi above = value < Lowest ? 0 : (value - Lowest) / Width;
    const auto bin = static_cast<std::size_t>(above);
    ++bins[bin < Bins ? bin : Bins - 1];
  }
};
using PowerHistogram = Histogram<16, -14000, 600>;   // RSRP
using QualityHistogram = Histogram<12, -2000, 150>;  // RSRQ
using SinrHistogram = Histogram<16, -1000, 250>;

/// Since the start of the run. None ever runs back.
struct Counters {
  std::array<std::uint64_t, kRrcStates> lteStateVisits{};
  std::array<std::uint64_t, kRrcStates> lteStateMs{};  // up to the last change of state
  std::array<std::uint64_t, kRrcStates> umtsStateVisits{};
  std::array<std::uint64_t, kRrcStates> umtsStateMs{};
  std::array<PowerHistogram, 4> power;  // LTE serving cell, one each antenna
  std::array<QualityHistogram, 4> quality;
  std::array<SinrHistogram, 4> sinr;
  std::uint64_t measurements = 0;
  std::uint64_t rachAttempts = 0;
  std::uint64_t rachFailures = 0;
  std::uint64_t nrRachFailures = 0;
  std::uint64_t connectionRequests = 0;
  std::uint64_t connectionsOriginated = 0;
  std::uint64_t connectionsTerminated = 0;  // by a page
  std::uint64_t connectionsSignalling = 0;
  std::uint64_t connectionsCompleted = 0;
  std::uint64_t connectionsReleased = 0;  // for whatever cause
  std::uint64_t handovers = 0;
  std::uint64_t handoverFailures = 0;
  std::uint64_t reselections = 0;
  std::uint64_t linkFailures = 0;  // LTE
  std::uint64_t nrLinkFailures = 0;
  std::uint64_t secondaryGroupFailures = 0;
  std::uint64_t beamFailures = 0;
  std::uint64_t registrations = 0;
  std::uint64_t pages = 0;
  std::uint64_t calls = 0;
  std::uint64_t callsConnected = 0;
  std::uint64_t callsDropped = 0;
  std::uint64_t dataStalls = 0;
  std::uint64_t downlinkBytes = 0;
  std::uint64_t uplinkBytes = 0;
  std::uint64_t pdcpUplinkPackets = 0;
  std::uint64_t pdcpUplinkDiscards = 0;
  std::uint64_t nrPdcpUplinkPackets = 0;
  std::uint64_t nrPdcpUplinkDiscards = 0;
};

/// A CDMA 1x base station as found by a scan for any system.
struct CdmaSystem {
  std::uint16_t mcc = 0;
  std::uint16_t systemId = 0;
  std::uint16_t networkId = 0;
  std::uint8_t bandClass = 0;
  std::uint16_t channel = 0;
  std::uint16_t pilot = 0;
  std::uint16_t baseId = 0;
};

/// Where the phone is; the same for both subscriptions.
struct Surroundings {
  double x = 0;  // metres
  double y = 0;
  double metresTravelled = 0;
  double metresPerSecond = 0;
  std::uint16_t headingDegrees = 0;  // clockwise from north
  MotionState motion = MotionState::Stationary;
  SimulatedMs motionSinceMs = 0;
  Centi zoneLoss = 0;  // of the building or tunnel the phone is in
  bool isScreenOn = true;
  std::int32_t radioMilliCelsius = 30000;
};

struct SubscriptionState {
  std::uint8_t subscription = 0;   // 0 for slot 1, 1 for slot 2
  std::uint8_t subscriptions = 1;  // SIMs present
  bool isDataPreferred = true;     // this one carries the data
  SimulatedMs nowMs = 0;
  Surroundings surroundings;

  // SIM.
  bool isSimPresent = false;
  Plmn home;
  std::string carrier;
  std::string imsi;  // of a test network

  // Service.
  OperatingMode mode = OperatingMode::PowerOff;
  SimulatedMs modeSinceMs = 0;
  ServiceStatus service = ServiceStatus::NoService;
  ServiceDomain domain = ServiceDomain::None;
  RoamStatus roaming = RoamStatus::Off;
  SimulatedMs serviceSinceMs = 0;
  RegistrationContext registration;
  Plmn previousPlmn;

  // Radio. No serving cell: `technology` is None and `serving` is empty.
  Technology technology = Technology::None;
  std::optional<ServingMeasurement> serving;
  std::vector<CellMeasurement> neighbours;       // same technology, strongest first, serving cell not among them
  std::vector<CellMeasurement> otherNeighbours;  // other technologies, grouped by technology, strongest first
  ReselectionParameters reselection;
  RrcState rrc = RrcState::None;
  RrcCause rrcCause = RrcCause::None;
  SimulatedMs rrcSinceMs = 0;
  DrxConfiguration drx;
  Centi transmitPower = 0;         // total, last sent
  Centi transmitPowerControl = 0;  // PUCCH, or UMTS DPCCH
  std::vector<SecondaryCarrier> carriers;
  std::optional<SecondaryGroup> nr;  // EN-DC
  ConnectionUse use;                 // of the connection at hand
  NrSaving saving;
  std::vector<CdmaSystem> cdma;  // of the last scan

  // Bearers and data.
  std::vector<Bearer> bearers;
  bool isDataActive = false;
  LinkQuality linkQuality = LinkQuality::Unknown;
  SimulatedMs linkQualitySinceMs = 0;
  bool isDataStalled = false;
  TunerState tuner;
  SimulatedMs tunerSinceMs = 0;

  Call call;  // phase None: there is none now
  Counters counters;
};

}  // namespace quorl::simulator::network
