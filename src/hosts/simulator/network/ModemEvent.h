#pragma once

#include <cstdint>
#include <variant>

#include "hosts/simulator/network/Cell.h"
#include "hosts/simulator/network/ModemState.h"

// What happens in a modem. An event tells what has changed; what is so after it stands in the state handed out with it.
// Cells are those of the modem's network and live as long as it.

namespace quorl::simulator::network {

namespace event {

/// A round of measurements: in idle each paging cycle, in a connection each 200 ms.
struct Measured {
  bool isConnected = false;
};

enum class ChangeReason : std::uint8_t { Selection, Reselection, Handover, Reestablishment, Redirection, Lost };
/// The serving cell is another. Null: there was none, or there is none.
struct ServingCellChanged {
  const Cell* from = nullptr;
  const Cell* to = nullptr;
  ChangeReason reason = ChangeReason::Selection;
};

/// Master and system information blocks of a cell were read, before it is camped on or added.
struct SystemInformationRead {
  const Cell* cell = nullptr;
  std::uint8_t valueTag = 0;  // 0 to 31
};

enum class RachReason : std::uint8_t {
  InitialAccess,
  Reestablishment,
  Handover,
  SecondaryGroup,
  UplinkData,
  BeamRecovery
};
enum class RachResult : std::uint8_t { Success, NoResponse, ContentionLost, NoContentionAnswer, Aborted };
struct RachAttempt {
  const Cell* cell = nullptr;
  RachReason reason = RachReason::InitialAccess;
  RachResult result = RachResult::Success;
  std::uint8_t preambles = 1;
  bool isContentionBased = true;
  bool isPowerLimited = false;
  Centi transmitPower = 0;
  Centi power = 0;  // of the cell, as measured
  std::uint8_t beam = 0;
};

/// The RRC state of a technology is another.
struct RrcChanged {
  Technology technology = Technology::None;
  RrcState state = RrcState::None;
  RrcState previous = RrcState::None;
  std::uint64_t previousMs = 0;  // how long the previous one lasted
  RrcCause cause = RrcCause::None;
  bool isNonStandAlone = false;  // NR beside LTE
};

/// Messages of TS 36.331, TS 38.331 told apart as far as somebody looks at them.
enum class AirMessageKind : std::uint8_t {
  Mib,
  Sib1,
  SystemInformation,
  Paging,
  ConnectionRequest,
  ConnectionSetup,
  ConnectionReject,
  ConnectionSetupComplete,
  SecurityModeCommand,
  SecurityModeComplete,
  Reconfiguration,
  ReconfigurationComplete,
  MeasurementReport,
  UplinkTransfer,
  DownlinkTransfer,
  CapabilityEnquiry,
  CapabilityInformation,
  MobilityCommand,
  ConnectionRelease,
  ReestablishmentRequest,
  Reestablishment,
  ReestablishmentComplete,
  ReestablishmentReject,
  ResumeRequest,
  Resume,
  ResumeComplete,
};
/// A message of LTE or NR over the air.
struct AirMessage {
  const Cell* cell = nullptr;
  AirMessageKind kind = AirMessageKind::Paging;
  bool isUplink = false;
  std::uint8_t bearer = 0;   // signalling radio bearer 0 to 3
  std::uint16_t length = 0;  // octets, 2 to some hundreds
};

/// NR stand-alone: from inactive to connected.
struct NrResumed {
  bool isSuccess = true;
  std::uint32_t durationMs = 0;
  RrcCause reason = RrcCause::MoData;
};

enum class HandoverTrigger : std::uint8_t { A3, A5, B1, B2, Redirection };
/// A handover that was ordered, with the measurements that called for it (TS 36.331 5.5.4).
struct Handover {
  const Cell* from = nullptr;
  const Cell* to = nullptr;
  HandoverTrigger trigger = HandoverTrigger::A3;
  Centi servingPower = 0;  // as filtered when the report was sent
  Centi targetPower = 0;
  std::uint16_t timeToTriggerMs = 0;
  std::uint16_t interruptionMs = 0;
  bool isSuccess = true;
};

struct SecondaryGroupAdded {
  const Cell* cell = nullptr;
  bool isSuccess = true;
  bool isChange = false;  // from another NR cell
};
enum class GroupRemoval : std::uint8_t { Released, LinkFailure, Handover, Weak, Saving };
struct SecondaryGroupRemoved {
  GroupRemoval reason = GroupRemoval::Released;
  std::uint32_t durationMs = 0;
  SecondaryGroup group;  // as it was last
  ConnectionUse use;     // of the NR leg
};
struct BeamSwitched {
  const Cell* cell = nullptr;
  std::uint8_t from = 0;
  std::uint8_t to = 0;
  std::uint32_t durationBeforeMs = 0;
  Centi fromPower = 0;
  Centi toPower = 0;
};

/// Secondary carriers were configured, activated, deactivated or removed.
struct CarriersChanged {};
/// DRX of the connection, or of a new cell's paging.
struct DrxChanged {};

enum class LinkFailureReason : std::uint8_t { T310Expiry, RandomAccess, RetransmissionLimit, HandoverFailure };
struct RadioLinkFailed {
  const Cell* cell = nullptr;
  LinkFailureReason reason = LinkFailureReason::T310Expiry;
  std::uint16_t timerMs = 0;  // T310
  Centi lastPower = 0;
  bool isNonStandAlone = false;  // of the NR leg
};

enum class ConnectionEnd : std::uint8_t { Release, Handover, Failure };
/// A connection of LTE or NR on one cell group is over.
struct ConnectionEnded {
  Technology technology = Technology::Lte;
  const Cell* cell = nullptr;
  ConnectionEnd end = ConnectionEnd::Release;
  std::uint64_t durationMs = 0;
  ConnectionUse use;
  bool isNonStandAlone = false;
};

/// A registration was tried. What it led to stands in `SubscriptionState::registration`.
struct RegistrationAttempted {
  RegistrationProcedure procedure = RegistrationProcedure::None;
  const Cell* cell = nullptr;
  bool isAccepted = true;
  std::uint8_t rejectCause = 0;
  bool isHome = true;
};
/// Another network, or a network after none.
struct PlmnChanged {
  Plmn from;
  Plmn to;
};
struct ServiceChanged {
  ServiceStatus previous = ServiceStatus::None;
  std::uint64_t previousMs = 0;
};
struct OperatingModeChanged {
  OperatingMode previous = OperatingMode::PowerOff;
  std::uint64_t previousMs = 0;
};
struct SimChanged {
  bool isPresent = true;
};
struct BearersChanged {};
/// A scan for any system met CDMA base stations, or no longer does.
struct CdmaScanned {};

enum class LinkReason : std::uint8_t { Signal, RachFailures, RetransmissionLimit, HighPower, Rejected };
struct LinkQualityChanged {
  LinkQuality previous = LinkQuality::Unknown;
  std::uint64_t previousMs = 0;
  LinkReason reason = LinkReason::Signal;
};
struct DataStall {
  bool hasBegun = true;  // else it is over
  bool isDnsFailure = false;
  std::uint64_t durationMs = 0;  // of one that is over
};
enum class HealthKind : std::uint8_t {
  NoSearch,
  DataStalled,
  RepeatedGroupFailures,
  RepeatedBeamFailures,
  FrequentLinkFailures,
  FrequentRachFailures,
  FrequentNrLinkFailures,
  FrequentNrRachFailures,
  PowerFloor,
  SimError,
};
struct HealthFinding {
  HealthKind kind = HealthKind::DataStalled;
  std::uint32_t occurrences = 0;  // in the window that was looked at
};
struct TunerChanged {
  TunerState previous;
  std::uint64_t previousMs = 0;
};
struct SavingChanged {
  NrSaving previous;
  bool hasReleasedGroup = false;  // EN-DC was released for it
};

enum class CallStep : std::uint8_t { Dialled, Paged, FallbackOrdered, SetUp, Alerting, Connected, HandedOver, Ended };
/// `SubscriptionState::call` is the call after this step, also after its last.
struct CallProgress {
  CallStep step = CallStep::Dialled;
};
enum class PageFailure : std::uint8_t { ConnectionFailed, ConnectionLost, FallbackFailed, Ignored };
/// A page for a circuit-switched call that was not answered.
struct PageResponseFailed {
  Technology pagedOn = Technology::Lte;
  const Cell* cell = nullptr;
  const Cell* attemptedCell = nullptr;  // where the fall back went; may be null
  PageFailure cause = PageFailure::ConnectionFailed;
};
/// A page for this subscription came.
struct Paged {};

enum class DataConnectionStatus : std::uint8_t { Disconnected, Connecting, Connected, Disconnecting };
struct DataConnectionChanged {
  bool isIms = false;
  DataConnectionStatus status = DataConnectionStatus::Disconnected;
};

enum class CueKind : std::uint8_t { Malformed, Oversized, Burst };
/// The scenario asks for traffic on the metric channel that has nothing to do with the radio.
struct Cue {
  CueKind kind = CueKind::Burst;
  std::uint32_t count = 1;  // metrics
  std::uint32_t bytes = 0;  // of each oversized payload
};

}  // namespace event

using ModemEventBody =
    std::variant<event::Measured, event::ServingCellChanged, event::SystemInformationRead, event::RachAttempt,
                 event::RrcChanged, event::AirMessage, event::NrResumed, event::Handover, event::SecondaryGroupAdded,
                 event::SecondaryGroupRemoved, event::BeamSwitched, event::CarriersChanged, event::DrxChanged,
                 event::RadioLinkFailed, event::ConnectionEnded, event::RegistrationAttempted, event::PlmnChanged,
                 event::ServiceChanged, event::OperatingModeChanged, event::SimChanged, event::BearersChanged,
                 event::CdmaScanned, event::LinkQualityChanged, event::DataStall, event::HealthFinding,
                 event::TunerChanged, event::SavingChanged, event::CallProgress, event::PageResponseFailed,
                 event::Paged, event::DataConnectionChanged, event::Cue>;

struct ModemEvent {
  SimulatedMs atMs = 0;           // never before the event before it, over both subscriptions
  std::uint8_t subscription = 0;  // 0 for slot 1, 1 for slot 2; cues: 0
  ModemEventBody body;
};

}  // namespace quorl::simulator::network
