#pragma once

#include <array>
#include <cstdint>
#include <string>

// What a cell is and how it is received, the same for all radio technologies. Levels are whole hundredths of a decibel:
// they are the same on every machine, and no reader rounds them a second time.

namespace quorl::simulator::network {

enum class Technology : std::uint8_t { None, Gsm, Umts, Lte, Nr };

constexpr bool isPacketCell(Technology technology) {
  return technology == Technology::Lte || technology == Technology::Nr;
}

/// Milliseconds since the start of the run.
using SimulatedMs = std::uint64_t;
/// 1/100 dBm or 1/100 dB.
using Centi = std::int32_t;

struct Plmn {
  std::uint16_t mcc = 0;
  std::uint16_t mnc = 0;
  std::uint8_t mncDigits = 2;

  bool operator==(const Plmn&) const = default;
};

/// The three octets of a network code (TS 24.008, 10.5.1.13).
std::array<std::uint8_t, 3> encoded(const Plmn& plmn);

/// One cell: a sector on one carrier. Cells keep their address as long as their network.
struct Cell {
  std::uint16_t index = 0;  // in the network; no two cells share it
  Technology technology = Technology::None;
  Plmn plmn;
  std::uint16_t band = 0;             // LTE, NR and UMTS: the band's number; GSM: 850, 900, 1800 or 1900
  std::uint32_t downlinkChannel = 0;  // EARFCN, NR-ARFCN, UARFCN or ARFCN
  std::uint32_t uplinkChannel = 0;
  std::uint32_t downlinkKhz = 0;  // centre of the carrier
  std::uint32_t uplinkKhz = 0;
  std::uint16_t physicalId = 0;  // LTE 0 to 503, NR 0 to 1007, UMTS scrambling code 0 to 511, GSM BSIC 0 to 63
  std::uint32_t areaCode = 0;    // TAC, or LAC
  std::uint8_t routingArea = 0;  // UMTS and GSM
  std::uint64_t cellId = 0;      // LTE 28 bits, NR 36 bits, UMTS 28 bits, GSM 16 bits
  std::uint16_t bandwidthMhzX10 = 0;
  std::uint16_t resourceBlocks = 0;  // LTE and NR
  std::uint8_t subCarrierSpacingKhz = 15;
  bool isTdd = false;
  std::uint8_t txPorts = 1;     // antenna ports of the cell: the most layers that it sends
  std::uint8_t beams = 1;       // NR: number of SSB
  std::uint8_t priority = 0;    // reselection priority of its carrier, 0 to 7
  bool isStandAlone = false;    // NR: can be camped on
  bool isNrAnchor = false;      // LTE: upperLayerIndication, EN-DC is possible here
  std::uint16_t siteIndex = 0;  // in the network
};

/// A received cell. Ranges: RSRP TS 36.133 9.1.4 and TS 38.133 10.1.6, RSRQ 9.1.7 and 10.1.11, SINR TS 38.133 10.1.16,
/// RSCP and Ec/N0 TS 25.133 9.1.1 and 9.1.2, RXLEV TS 45.008 8.1.4.
struct CellMeasurement {
  const Cell* cell = nullptr;  // never null in what the modem hands out
  Centi power = 0;             // RSRP, RSCP or RXLEV in dBm
  Centi quality = 0;           // RSRQ or Ec/N0; GSM: 0
  Centi sinr = 0;              // GSM: carrier to interference
  Centi rssi = 0;              // over the whole carrier
  std::uint8_t beam = 0;       // NR: the strongest SSB
};

enum class Modulation : std::uint8_t { Bpsk, Qpsk, Qam16, Qam64, Qam256, Qam1024 };

/// The serving cell in full.
struct ServingMeasurement {
  CellMeasurement best;
  std::array<Centi, 4> antennaPower{};    // RSRP at each receive antenna; `best.power` is the strongest of them
  std::array<Centi, 4> antennaQuality{};  // RSRQ
  std::array<Centi, 4> antennaSinr{};
  std::uint8_t antennas = 2;  // how many of them are in use
  std::uint8_t cqi = 0;       // 0 to 15, TS 36.213 table 7.2.3-2
  std::uint8_t rank = 1;      // 1 to 4, never above the cell's ports or the antennas
  Modulation downlink = Modulation::Qpsk;
  Modulation uplink = Modulation::Qpsk;
  Centi pathLoss = 0;
  std::uint32_t downlinkKbps = 0;  // what flows now, 0 without data
  std::uint32_t uplinkKbps = 0;
};

}  // namespace quorl::simulator::network
