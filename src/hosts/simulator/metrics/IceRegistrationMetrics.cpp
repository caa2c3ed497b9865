#include <string>
#include <string_view>

#include "hosts/simulator/metrics/MetricFields.h"
#include "messages/MessageRef.h"
#include "messages/classes/nas_context.h"
#include "messages/classes/sim.h"

// Registration contexts, bearers and SIM files of family Ice.

namespace quorl::simulator::metrics {

namespace event = network::event;
using network::RegistrationContext;
using network::RegistrationProcedure;
using network::RegistrationState;
using network::SubscriptionState;
using network::Technology;

namespace {

std::int32_t statusNumber(const SubscriptionState& state) {
  if (state.mode != network::OperatingMode::Online) return KREG_STATUS_POWER_OFF_NO_SERVICE;
  switch (state.registration.state) {
    case RegistrationState::NotRegistered:
      return state.serving ? KREG_STATUS_AT_NOT_REGISTERED : KREG_STATUS_NO_SERVICE;
    case RegistrationState::InProgress:
      return KREG_STATUS_REGISTRATION_IN_PROGRESS;
    case RegistrationState::Registered:
      return KREG_STATUS_NORMAL_SERVICE;
    case RegistrationState::Denied:
      return KREG_STATUS_REGISTRATION_FAILURE;
    case RegistrationState::Limited:
      return KREG_STATUS_LIMITED_SERVICE;
  }
  return KREG_STATUS_NO_SERVICE;
}

bool isRegistered(const SubscriptionState& state) {
  return state.registration.state == RegistrationState::Registered;
}

bool isCombinedProcedure(RegistrationProcedure procedure) {
  return procedure == RegistrationProcedure::CombinedAttach || procedure == RegistrationProcedure::CombinedAreaUpdate;
}

std::int32_t epsProcedure(RegistrationProcedure procedure) {
  using Context = KCellularEmmContext;
  switch (procedure) {
    case RegistrationProcedure::None:
      return Context::EMM_PROC_NO_PROC;
    case RegistrationProcedure::Attach:
      return Context::EMM_PROC_ATTACH;
    case RegistrationProcedure::CombinedAttach:
      return Context::EMM_PROC_ATTACH_COMB;
    case RegistrationProcedure::AreaUpdate:
      return Context::EMM_PROC_TAU;
    case RegistrationProcedure::CombinedAreaUpdate:
      return Context::EMM_PROC_TAU_COMB;
    case RegistrationProcedure::PeriodicUpdate:
      return Context::EMM_PROC_PERIODIC_TAU;
    case RegistrationProcedure::ServiceRequest:
      return Context::EMM_PROC_SERV_REQ;
  }
  return Context::EMM_PROC_NO_PROC;
}

Payload epsContext(const Moment& moment) {
  using Context = KCellularEmmContext;
  const SubscriptionState& state = moment.state;
  if (state.technology != Technology::Lte) return std::nullopt;
  const RegistrationContext& registration = state.registration;
  Context message;
  setCommon(message, moment);
  message.setRegStatus(statusNumber(state));
  message.setUpdateStatus(isRegistered(state) ? Context::EPS_STATUS_UPDATED : Context::EPS_STATUS_NOT_UPDATED);
  message.setUeOpMode(Context::EPS_UE_OP_MODE_CSPS_MODE_1);
  for (const std::uint32_t code : registration.areas) {
    auto area = makeMessageRef<KCellularTrackingAreaId>();
    area->setEncodedPlmn(plmnBytes(registration.plmn));
    area->setTac(code);
    message.addTaiList(area);
  }
  auto identity = makeMessageRef<Guti>();
  identity->setMmegi(registration.groupId);
  identity->setMmec(registration.code);
  identity->setMTmsi(registration.temporaryId);
  message.setGuti(identity);
  message.setRejectCause(registration.rejectCause);
  message.setRegProc(epsProcedure(registration.procedure));
  message.setT3412DurS(registration.periodicTimerSeconds);
  message.setIsImsVoiceSupported(registration.isImsVoiceSupported);
  message.setIsEmergBearerSupported(registration.isEmergencySupported);
  return payload(message);
}

/// Whether the circuit-switched and the packet contexts of UMTS and GSM are concerned: always there, and on LTE by
/// registrations that include them.
bool hasOlderContexts(const SubscriptionState& state) {
  return state.technology == Technology::Umts || state.technology == Technology::Gsm ||
         (state.technology == Technology::Lte && isCombinedProcedure(state.registration.procedure));
}

std::int32_t failureCause(const RegistrationContext& registration) {
  return registration.rejectCause != 0 ? KNAS_MM_PROC_FAILURE_CAUSE_REJECTED_BY_NW : KNAS_MM_PROC_FAILURE_CAUSE_NONE;
}

/// Sets what the circuit-switched and the packet context say alike.
template <typename Message>
void setOlderContext(Message& message, const Moment& moment) {
  setCommon(message, moment);
  message.setRegStatus(statusNumber(moment.state));
  message.setProcFailureCause(failureCause(moment.state.registration));
  message.setRejectCause(moment.state.registration.rejectCause);
}

template <typename Area>
auto olderArea(const RegistrationContext& registration) {
  auto area = makeMessageRef<Area>();
  area->setEncodedPlmn(plmnBytes(registration.plmn));
  area->setLac(registration.areaCode);
  return area;
}

Payload circuitContext(const Moment& moment) {
  using Context = KCellularMmContext;
  const SubscriptionState& state = moment.state;
  if (!hasOlderContexts(state)) return std::nullopt;
  const RegistrationContext& registration = state.registration;
  Context message;
  setOlderContext(message, moment);
  message.setUpdateStatus(isRegistered(state) ? Context::STATUS_UPDATED : Context::STATUS_NOT_UPDATED);
  message.setLai(olderArea<KCellularLocationAreaId>(registration));
  message.setTmsi(registration.circuitTemporaryId);
  message.setT3212DurS(registration.periodicTimerSeconds);
  message.setIsCombinedProc(isCombinedProcedure(registration.procedure));
  return payload(message);
}

std::int32_t packetProcedure(RegistrationProcedure procedure) {
  using Context = KCellularGmmContext;
  switch (procedure) {
    case RegistrationProcedure::None:
      return Context::KNAS_MM_REG_PROC_PROC_NONE;
    case RegistrationProcedure::Attach:
      return Context::KNAS_MM_REG_PROC_ATTACH;
    case RegistrationProcedure::CombinedAttach:
      return Context::KNAS_MM_REG_PROC_COMBINED_ATTACH;
    case RegistrationProcedure::AreaUpdate:
    case RegistrationProcedure::PeriodicUpdate:
      return Context::KNAS_MM_REG_PROC_ROUTING_AREA_UPDATE;
    case RegistrationProcedure::CombinedAreaUpdate:
      return Context::KNAS_MM_REG_PROC_COMBINED_RAU;
    case RegistrationProcedure::ServiceRequest:
      return Context::KNAS_MM_REG_PROC_SERVICE_REQ;
  }
  return Context::KNAS_MM_REG_PROC_PROC_NONE;
}

Payload packetContext(const Moment& moment) {
  using Context = KCellularGmmContext;
  const SubscriptionState& state = moment.state;
  if (!hasOlderContexts(state)) return std::nullopt;
  const RegistrationContext& registration = state.registration;
  Context message;
  setOlderContext(message, moment);
  message.setUpdateStatus(isRegistered(state) ? Context::GPRS_STATUS_UPDATED : Context::GPRS_STATUS_NOT_UPDATED);
  auto area = olderArea<RoutingAreaId>(registration);
  area->setRac(state.serving ? state.serving->best.cell->routingArea : 0U);
  message.setRai(area);
  message.setPTmsi(registration.temporaryId);
  message.setT3312DurS(registration.periodicTimerSeconds);
  message.setRegProc(packetProcedure(registration.procedure));
  return payload(message);
}

/// The name server stands first in the network of the address.
ByteString serverOf(std::array<std::uint8_t, 4> address) {
  address[3] = 1;
  return ByteString(std::string(address.begin(), address.end()));
}

Payload bearers(const Moment& moment) {
  const SubscriptionState& state = moment.state;
  KCellularActivatedBearerContexts message;
  setCommon(message, moment);
  message.setBearerContextCount(u32(state.bearers.size()));
  std::uint32_t context = 1;
  for (const network::Bearer& each : state.bearers) {
    auto bearer = makeMessageRef<BearerContext>();
    bearer->setCid(context++);
    bearer->setNsapi(each.id);
    bearer->setApn(Text(each.accessPoint));
    bearer->setPdpType(PDP_TYPE_IPv4);
    bearer->setPdpAddr(ByteString(std::string(each.address.begin(), each.address.end())));
    bearer->setPrimaryDnsType(PDP_TYPE_IPv4);
    bearer->setPrimaryDnsAddr(serverOf(each.address));
    bearer->setIsAddrIratMobile(true);
    message.addBearerContexts(bearer);
  }
  return payload(message);
}

/// Digits two an octet, the first in its lower half; the first octet holds the count of octets (TS 31.102 4.2.2).
std::string packedImsi(std::string_view digits) {
  std::string nibbles = "9";
  nibbles.append(digits);
  if (nibbles.size() % 2 != 0) nibbles.push_back('?');  // 15
  std::string packed(1, static_cast<char>(nibbles.size() / 2));
  for (std::size_t i = 0; i < nibbles.size(); i += 2) {
    const auto low = static_cast<unsigned>(nibbles[i] - '0');
    const auto high = static_cast<unsigned>(nibbles[i + 1] - '0');
    packed.push_back(static_cast<char>((low & 0xFU) | ((high & 0xFU) << 4U)));
  }
  return packed;
}

void addFile(KCellularSimCardFiles& message, std::uint32_t id, const std::string& octets) {
  auto file = makeMessageRef<ElementaryFile>();
  file->setEfId(id);
  file->setContent(ByteString(octets));
  message.addEf(file);
}

Payload simFiles(const Moment& moment) {
  constexpr std::uint32_t kImsiFile = 0x6F07;
  constexpr std::uint32_t kNameFile = 0x6F46;
  constexpr std::uint32_t kAdministrativeFile = 0x6FAD;
  const SubscriptionState& state = moment.state;
  if (!state.isSimPresent) return std::nullopt;
  KCellularSimCardFiles message;
  setCommon(message, moment);
  addFile(message, kImsiFile, packedImsi(state.imsi));
  addFile(message, kNameFile, std::string(1, '\0') + state.carrier);
  addFile(message, kAdministrativeFile, {'\0', '\0', '\0', static_cast<char>(state.home.mncDigits)});
  return payload(message);
}

constexpr MetricKind kIceRegistrationMetrics[] = {
    {3986700, on<event::RegistrationAttempted>(), epsContext, /*isCurrent=*/true},
    {3986698, on<event::RegistrationAttempted>(), circuitContext, /*isCurrent=*/true},
    {3986699, on<event::RegistrationAttempted>(), packetContext, /*isCurrent=*/true},
    {3986701, on<event::BearersChanged>(), bearers, /*isCurrent=*/true},
    {3932179, on<event::SimChanged>(), simFiles, /*isCurrent=*/true},
};

}  // namespace

std::span<const MetricKind> iceRegistrationKinds() {
  return kIceRegistrationMetrics;
}

}  // namespace quorl::simulator::metrics
