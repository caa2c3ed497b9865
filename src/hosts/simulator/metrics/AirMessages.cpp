#include "hosts/simulator/metrics/AirMessages.h"

namespace quorl::simulator::metrics {

using Kind = network::event::AirMessageKind;

AirType lteAirType(Kind kind) {
  switch (kind) {
    case Kind::Mib:
      return {AirChannel::Bcch, 0};
    case Kind::SystemInformation:
      return {AirChannel::BcchShared, 0};
    case Kind::Sib1:
      return {AirChannel::BcchShared, 1};
    case Kind::Paging:
      return {AirChannel::Pcch, 0};
    case Kind::ReestablishmentRequest:
      return {AirChannel::UplinkCommon, 0};
    case Kind::ConnectionRequest:
    case Kind::ResumeRequest:
      return {AirChannel::UplinkCommon, 1};
    case Kind::Reestablishment:
      return {AirChannel::DownlinkCommon, 0};
    case Kind::ReestablishmentReject:
      return {AirChannel::DownlinkCommon, 1};
    case Kind::ConnectionReject:
      return {AirChannel::DownlinkCommon, 2};
    case Kind::ConnectionSetup:
    case Kind::Resume:
      return {AirChannel::DownlinkCommon, 3};
    case Kind::DownlinkTransfer:
      return {AirChannel::DownlinkDedicated, 1};
    case Kind::MobilityCommand:
      return {AirChannel::DownlinkDedicated, 3};
    case Kind::Reconfiguration:
      return {AirChannel::DownlinkDedicated, 4};
    case Kind::ConnectionRelease:
      return {AirChannel::DownlinkDedicated, 5};
    case Kind::SecurityModeCommand:
      return {AirChannel::DownlinkDedicated, 6};
    case Kind::CapabilityEnquiry:
      return {AirChannel::DownlinkDedicated, 7};
    case Kind::MeasurementReport:
      return {AirChannel::UplinkDedicated, 1};
    case Kind::ReconfigurationComplete:
      return {AirChannel::UplinkDedicated, 2};
    case Kind::ReestablishmentComplete:
      return {AirChannel::UplinkDedicated, 3};
    case Kind::ConnectionSetupComplete:
    case Kind::ResumeComplete:
      return {AirChannel::UplinkDedicated, 4};
    case Kind::SecurityModeComplete:
      return {AirChannel::UplinkDedicated, 5};
    case Kind::CapabilityInformation:
      return {AirChannel::UplinkDedicated, 7};
    case Kind::UplinkTransfer:
      return {AirChannel::UplinkDedicated, 9};
  }
  return {};
}

AirType nrAirType(Kind kind) {
  switch (kind) {
    case Kind::Mib:
      return {AirChannel::Bcch, 0};
    case Kind::SystemInformation:
      return {AirChannel::BcchShared, 0};
    case Kind::Sib1:
      return {AirChannel::BcchShared, 1};
    case Kind::Paging:
      return {AirChannel::Pcch, 0};
    case Kind::ConnectionRequest:
      return {AirChannel::UplinkCommon, 0};
    case Kind::ResumeRequest:
      return {AirChannel::UplinkCommon, 1};
    case Kind::ReestablishmentRequest:
      return {AirChannel::UplinkCommon, 2};
    case Kind::ConnectionReject:
    case Kind::ReestablishmentReject:
      return {AirChannel::DownlinkCommon, 0};
    case Kind::ConnectionSetup:
      return {AirChannel::DownlinkCommon, 1};
    case Kind::Reconfiguration:
      return {AirChannel::DownlinkDedicated, 0};
    case Kind::Resume:
      return {AirChannel::DownlinkDedicated, 1};
    case Kind::ConnectionRelease:
      return {AirChannel::DownlinkDedicated, 2};
    case Kind::Reestablishment:
      return {AirChannel::DownlinkDedicated, 3};
    case Kind::SecurityModeCommand:
      return {AirChannel::DownlinkDedicated, 4};
    case Kind::DownlinkTransfer:
      return {AirChannel::DownlinkDedicated, 5};
    case Kind::CapabilityEnquiry:
      return {AirChannel::DownlinkDedicated, 6};
    case Kind::MobilityCommand:
      return {AirChannel::DownlinkDedicated, 8};
    case Kind::MeasurementReport:
      return {AirChannel::UplinkDedicated, 0};
    case Kind::ReconfigurationComplete:
      return {AirChannel::UplinkDedicated, 1};
    case Kind::ConnectionSetupComplete:
      return {AirChannel::UplinkDedicated, 2};
    case Kind::ReestablishmentComplete:
      return {AirChannel::UplinkDedicated, 3};
    case Kind::ResumeComplete:
      return {AirChannel::UplinkDedicated, 4};
    case Kind::SecurityModeComplete:
      return {AirChannel::UplinkDedicated, 5};
    case Kind::UplinkTransfer:
      return {AirChannel::UplinkDedicated, 7};
    case Kind::CapabilityInformation:
      return {AirChannel::UplinkDedicated, 9};
  }
  return {};
}

}  // namespace quorl::simulator::metrics
