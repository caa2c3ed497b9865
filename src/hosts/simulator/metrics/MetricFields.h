#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "base/SharedBytes.h"
#include "hosts/simulator/metrics/MetricKinds.h"
#include "messages/MetricCodable.h"

// From what the modem knows to the numbers and texts that messages carry.

namespace quorl::simulator::metrics {

using Payload = std::optional<ByteString>;

inline constexpr std::size_t kMostNeighbours = 8;  // of a technology in one metric
inline constexpr std::int32_t kMostLtePower = 23;  // dBm, power class 3

/// What a finished message is on the wire.
ByteString payload(const MetricCodable& message);

/// Hundredths to whole units, half away from zero.
constexpr std::int32_t whole(network::Centi value) {
  return (value + (value < 0 ? -50 : 50)) / 100;
}

/// Field widths: identities of more than 32 bits lose their upper ones, counts and durations never come that far.
template <typename Number>
constexpr std::uint32_t u32(Number value) {
  return static_cast<std::uint32_t>(value);
}

ByteString plmnBytes(const network::Plmn& plmn);
/// The network in use: the serving cell's, else the registered one.
network::Plmn currentPlmn(const network::SubscriptionState& state);

// The serving cell of a technology; null while there is none.
const network::ServingMeasurement* servingOn(const network::SubscriptionState& state, network::Technology technology);
const network::ServingMeasurement* lteServing(const network::SubscriptionState& state);
/// Stand-alone, or the secondary cell group's.
const network::ServingMeasurement* nrServing(const network::SubscriptionState& state);
bool isConnected(const network::SubscriptionState& state);

/// Resource blocks as the display counts them: those of LTE, whose table ends at 20 MHz. Wider NR carriers are given
/// as the widest of them.
std::uint32_t resourceBlocks(const network::Cell& cell);
/// 0 to 5 for 1.4, 3, 5, 10, 15 and 20 MHz.
std::uint32_t bandwidthCode(const network::Cell& cell);
/// 1 for 410 to 7125 MHz, 2 above (TS 38.101-1 5.1).
std::uint32_t frequencyRange(const network::Cell& cell);

// Levels as measurement reports code them, within the range of the code.
/// RXLEV: 0 to 63 for -110 dBm and up (TS 45.008 8.1.4).
std::uint32_t rxlev(network::Centi power);
/// 0 to 49: half decibels above -24.5 dB (TS 25.133 9.1.2.3).
std::uint32_t ecnoCode(network::Centi quality);

// The numbering of the messages' enumerations.
std::int32_t sysMode(network::Technology technology);
std::int32_t sysRat(network::Technology technology);
/// Nothing for a band that the enumeration does not know.
std::optional<std::int32_t> sysBand(const network::Cell& cell);
std::int32_t serviceStatus(network::ServiceStatus status);
std::int32_t serviceDomain(network::ServiceDomain domain);
std::int32_t roamStatus(network::RoamStatus status);
std::int32_t modulation(network::Modulation modulation);
std::int32_t motion(network::MotionState motion);

/// A number below `limit` that depends on nothing but the run and these two, for what the world leaves open: such
/// details stay what they are for one cell.
std::uint32_t detail(const Moment& moment, std::uint64_t of, std::uint64_t what, std::uint32_t limit);
/// Octets that nobody reads.
ByteString content(const Moment& moment, std::size_t length);

/// Sets what nearly every message carries, as far as this one does.
template <typename Message>
void setCommon(Message& message, const Moment& moment) {
  const network::SubscriptionState& state = moment.state;
  message.setTimestamp(moment.timestampMs);
  if constexpr (requires { message.setSubsId(0U); }) message.setSubsId(state.subscription);
  if constexpr (requires { message.setNumSubs(0U); }) message.setNumSubs(state.subscriptions);
  if constexpr (requires { message.setPsPref(0U); }) {
    const std::uint32_t other = 1U - state.subscription;
    message.setPsPref(state.isDataPreferred ? state.subscription : other);
  }
  if constexpr (requires { message.setPlmn(ByteString()); }) message.setPlmn(plmnBytes(currentPlmn(state)));
  if constexpr (requires { message.setSimHplmn(ByteString()); }) message.setSimHplmn(plmnBytes(state.home));
}

/// Sets the numbers of a network, under whichever names the message has them.
template <typename Message>
void setNetwork(Message& message, const network::Plmn& plmn) {
  if constexpr (requires { message.setSelPlmnMcc(0U); }) message.setSelPlmnMcc(plmn.mcc);
  if constexpr (requires { message.setSelPlmnMnc(0U); }) message.setSelPlmnMnc(plmn.mnc);
  if constexpr (requires { message.setMcc(0U); }) message.setMcc(plmn.mcc);
  if constexpr (requires { message.setMnc(0U); }) message.setMnc(plmn.mnc);
  if constexpr (requires { message.setNumMncDigits(0U); }) message.setNumMncDigits(plmn.mncDigits);
}

/// Sets what LTE and NR alike say of a serving cell. `bandwidth` is in the unit of the message.
template <typename Message>
void setServingCell(Message& message, const network::Cell& cell, std::uint32_t bandwidth) {
  setNetwork(message, cell.plmn);
  message.setPhyCellId(cell.physicalId);
  message.setDlFreq(cell.downlinkChannel);
  message.setUlFreq(cell.uplinkChannel);
  message.setDlBw(bandwidth);
  message.setUlBw(bandwidth);
  message.setCellId(u32(cell.cellId));
  message.setTrackingAreaCode(cell.areaCode);
}

/// The same of LTE, whose families differ in little but the unit.
template <typename Message>
void setLteServingCell(Message& message, const network::Cell& cell, std::uint32_t bandwidth) {
  setServingCell(message, cell, bandwidth);
  message.setFreqBandInd(cell.band);
  message.setTddSfAssignment(cell.isTdd ? 2 : 0);
  message.setTddSsfPatterns(cell.isTdd ? 7 : 0);
  message.setHstCellInfo(0);
  message.setPrioOfCampedLteBand(cell.priority);
}

}  // namespace quorl::simulator::metrics
