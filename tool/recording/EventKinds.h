#pragma once

#include <cstdint>
#include <span>

#include "base/SharedBytes.h"
#include "messages/MetricCodable.h"
#include "messages/wire/WireWriter.h"
#include "recording/RadioWorld.h"

// Every kind of event that a recording can hold: which metric it is, how its payload is made and how often it comes.

namespace quorl::tool {

struct EventKind {
  std::int64_t metricID;
  std::uint32_t everyMs;
  ByteString (*make)(RadioWorld& world);
};

// Family Mav.
std::span<const EventKind> nrKinds();
std::span<const EventKind> lteKinds();
std::span<const EventKind> serviceKinds();
std::span<const EventKind> circuitSwitchedKinds();
// Family Ice.
std::span<const EventKind> iceLteKinds();
std::span<const EventKind> iceCircuitSwitchedKinds();
std::span<const EventKind> iceNasKinds();

// How often a kind comes.
inline constexpr std::uint32_t kOftenMs = 25000;
inline constexpr std::uint32_t kNowAndThenMs = 55000;
inline constexpr std::uint32_t kSeldomMs = 110000;

/// What a finished message is on the wire.
inline ByteString payload(const MetricCodable& message) {
  WireWriter writer;
  message.writeTo(writer);
  return ByteString(writer.bytes());
}

/// Sets what nearly every message carries, as far as this one does.
template <typename Message>
void setCommon(Message& message, const RadioWorld& world) {
  message.setTimestamp(world.timestampMs());
  if constexpr (requires { message.setSubsId(0U); }) message.setSubsId(world.subsId());
  if constexpr (requires { message.setNumSubs(0U); }) message.setNumSubs(2);
  if constexpr (requires { message.setPsPref(0U); }) message.setPsPref(0);
  if constexpr (requires { message.setPlmn(world.plmn()); }) message.setPlmn(world.plmn());
  if constexpr (requires { message.setSimHplmn(world.plmn()); }) message.setSimHplmn(world.plmn());
}

/// Sets the numbers of the network, under whichever names the message has them.
template <typename Message>
void setNetwork(Message& message, const RadioWorld& world) {
  if constexpr (requires { message.setSelPlmnMcc(0U); }) message.setSelPlmnMcc(world.mcc());
  if constexpr (requires { message.setSelPlmnMnc(0U); }) message.setSelPlmnMnc(world.mnc());
  if constexpr (requires { message.setMcc(0U); }) message.setMcc(world.mcc());
  if constexpr (requires { message.setMnc(0U); }) message.setMnc(world.mnc());
  if constexpr (requires { message.setNumMncDigits(0U); }) message.setNumMncDigits(world.mncDigits());
}

/// Sets what both families say of the serving LTE cell. `bandwidth` is in the unit of the message.
template <typename Message>
void setLteServingCell(Message& message, RadioWorld& world, std::uint32_t bandwidth) {
  setNetwork(message, world);
  const LteCell& cell = world.lte();
  message.setPhyCellId(cell.pci);
  message.setDlFreq(cell.dlEarfcn);
  message.setUlFreq(cell.ulEarfcn);
  message.setDlBw(bandwidth);
  message.setUlBw(bandwidth);
  message.setCellId(cell.cellId);
  message.setFreqBandInd(cell.band);
  message.setTrackingAreaCode(cell.tac);
  message.setTddSfAssignment(0);
  message.setTddSsfPatterns(0);
  message.setHstCellInfo(0);
  message.setPrioOfCampedLteBand(world.count(4, 7));
}

}  // namespace quorl::tool
