#include "messages/classes/nas_context.h"
#include "messages/classes/sim.h"
#include "recording/EventKinds.h"

// Registration contexts, bearers and SIM files of the family Ice.

namespace quorl::tool {
namespace {

ByteString epsContext(RadioWorld& world) {
  using Context = KCellularEmmContext;
  Context message;
  setCommon(message, world);
  message.setRegStatus(world.oneOf({KREG_STATUS_NORMAL_SERVICE, KREG_STATUS_LIMITED_SERVICE}));
  message.setUpdateStatus(Context::EPS_STATUS_UPDATED);
  message.setUeOpMode(Context::EPS_UE_OP_MODE_CSPS_MODE_1);
  auto area = makeMessageRef<KCellularTrackingAreaId>();
  area->setEncodedPlmn(world.plmn());
  area->setTac(world.lte().tac);
  message.addTaiList(area);
  auto identity = makeMessageRef<Guti>();
  identity->setMmegi(300);
  identity->setMmec(world.count(1, 9));
  identity->setMTmsi(world.count(0xC0000000, 0xC0FFFFFF));
  message.setGuti(identity);
  message.setRejectCause(Context::EMM_CAUSE_NO_CAUSE);
  message.setRegProc(world.oneOf({Context::EMM_PROC_TAU, Context::EMM_PROC_SERV_REQ, Context::EMM_PROC_NO_PROC}));
  message.setT3412DurS(3240);
  message.setIsImsVoiceSupported(true);
  message.setIsEmergBearerSupported(true);
  return payload(message);
}

ByteString circuitContext(RadioWorld& world) {
  using Context = KCellularMmContext;
  Context message;
  setCommon(message, world);
  message.setRegStatus(KREG_STATUS_NORMAL_SERVICE);
  message.setUpdateStatus(Context::STATUS_UPDATED);
  auto area = makeMessageRef<KCellularLocationAreaId>();
  area->setEncodedPlmn(world.plmn());
  area->setLac(world.gsm().lac);
  message.setLai(area);
  message.setTmsi(world.count(0xA0000000, 0xA0FFFFFF));
  message.setT3212DurS(3600);
  message.setProcFailureCause(KNAS_MM_PROC_FAILURE_CAUSE_NONE);
  message.setRejectCause(KNAS_MM_REJ_CAUSE_NONE);
  message.setIsCombinedProc(world.chance(50));
  return payload(message);
}

ByteString packetContext(RadioWorld& world) {
  using Context = KCellularGmmContext;
  Context message;
  setCommon(message, world);
  message.setRegStatus(KREG_STATUS_NORMAL_SERVICE);
  message.setUpdateStatus(Context::GPRS_STATUS_UPDATED);
  auto area = makeMessageRef<RoutingAreaId>();
  area->setEncodedPlmn(world.plmn());
  area->setLac(world.umts().lac);
  area->setRac(world.count(1, 4));
  message.setRai(area);
  message.setPTmsi(world.count(0xB0000000, 0xB0FFFFFF));
  message.setT3312DurS(3240);
  message.setProcFailureCause(KNAS_MM_PROC_FAILURE_CAUSE_NONE);
  message.setRejectCause(KNAS_MM_REJ_CAUSE_NONE);
  message.setRegProc(Context::KNAS_MM_REG_PROC_ROUTING_AREA_UPDATE);
  return payload(message);
}

/// An address of the range that is kept free for examples.
ByteString exampleAddress(RadioWorld& world) {
  const char address[] = {static_cast<char>(192), 0, 2, static_cast<char>(world.count(1, 254))};
  return ByteString(std::string_view(address, sizeof address));
}

ByteString bearers(RadioWorld& world) {
  KCellularActivatedBearerContexts message;
  setCommon(message, world);
  const std::uint32_t count = world.count(1, 2);
  message.setBearerContextCount(count);
  for (std::uint32_t index = 0; index < count; ++index) {
    auto bearer = makeMessageRef<BearerContext>();
    bearer->setCid(index + 1);
    bearer->setNsapi(5 + index);
    bearer->setApn(Text(index == 0 ? "internet.example" : "ims.example"));
    bearer->setPdpType(PDP_TYPE_IPv4);
    bearer->setPdpAddr(exampleAddress(world));
    bearer->setPrimaryDnsType(PDP_TYPE_IPv4);
    bearer->setPrimaryDnsAddr(exampleAddress(world));
    bearer->setIsAddrIratMobile(true);
    message.addBearerContexts(bearer);
  }
  return payload(message);
}

ByteString simFiles(RadioWorld& world) {
  KCellularSimCardFiles message;
  setCommon(message, world);
  for (const std::uint32_t id : {0x6FADU, 0x6F46U}) {
    auto file = makeMessageRef<ElementaryFile>();
    file->setEfId(id);
    file->setContent(world.bytes(4));
    message.addEf(file);
  }
  return payload(message);
}

constexpr EventKind kIceNasEvents[] = {
    {3986700, kOftenMs, epsContext}, {3986698, kNowAndThenMs, circuitContext}, {3986699, kNowAndThenMs, packetContext},
    {3986701, kOftenMs, bearers},    {3932179, kSeldomMs, simFiles},
};

}  // namespace

std::span<const EventKind> iceNasKinds() {
  return kIceNasEvents;
}

}  // namespace quorl::tool
