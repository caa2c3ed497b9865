#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <variant>
#include <vector>

#include "hosts/simulator/network/Cell.h"
#include "hosts/simulator/network/ModemEvent.h"
#include "hosts/simulator/network/ModemState.h"

// A scenario: a small radio network, a way through it, the SIMs, and what its user does.

namespace quorl::simulator::network {

/// Models of TR 38.901, table 7.4.1-1.
enum class Environment : std::uint8_t { UrbanMacro, StreetCanyon, RuralMacro };

struct Operator {
  std::string id;  // as the scenario's other lines name it
  Plmn plmn;
  std::string carrier;  // its name as shown
};

/// A carrier of an operator, as its sites may send it.
struct Layer {
  std::string id;
  std::uint8_t operatorIndex = 0;
  Technology technology = Technology::Lte;
  std::uint16_t band = 0;
  std::uint32_t channel = 0;
  std::uint16_t bandwidthMhzX10 = 0;
  Centi power = 4600;  // of the whole carrier, dBm
  std::uint8_t ports = 2;
  std::uint8_t beams = 1;
  std::uint8_t priority = 0;
  bool isStandAlone = false;
};

struct Site {
  std::uint8_t operatorIndex = 0;
  double x = 0;  // metres, east
  double y = 0;  // metres, north
  double height = 25;
  std::uint32_t areaCode = 0;
  std::vector<std::uint16_t> azimuths;  // degrees, one sector each; none: one sector without direction
  std::vector<std::uint16_t> layers;    // indices into Scenario::layers
};

/// Most zones of a scenario.
inline constexpr std::size_t kMostZones = 64;

/// A rectangle that weakens for the phone in it everything outside of it: a building or a tunnel.
struct Zone {
  std::string name;
  double left = 0;
  double bottom = 0;
  double right = 0;
  double top = 0;
  Centi loss = 0;

  bool contains(double x, double y) const { return x >= left && x <= right && y >= bottom && y <= top; }
};

struct Waypoint {
  double x = 0;
  double y = 0;
  double metresPerSecond = 0;  // on the way to it
  std::uint32_t waitMs = 0;    // once there
};
enum class RouteEnd : std::uint8_t { Stop, Loop, Return };

struct Sim {
  bool isPresent = false;
  std::uint8_t operatorIndex = 0;
  std::vector<std::uint8_t> roaming;  // operators that take it as a guest; all others refuse it
  double sessionsPerHour = 0;         // data sessions besides the script
  double sessionSeconds = 10;         // their mean length
  double callsPerHour = 0;
  double talkSeconds = 60;
  bool hasVoiceOverLte = true;  // else a call falls back
};

struct CdmaStation {
  double x = 0;
  double y = 0;
  double metres = 0;  // as far as it is heard
  CdmaSystem system;
};

namespace action {
struct PlaceCall {
  std::uint8_t subscription = 0;
  bool isOutgoing = true;
  double talkSeconds = 60;
  bool isAnswered = true;
};
struct UseData {
  std::uint8_t subscription = 0;
  double seconds = 10;
};
struct SetScreen {
  bool isOn = true;
};
struct SetAirplane {
  bool isOn = true;
};
struct SetSim {
  std::uint8_t subscription = 0;
  bool isPresent = true;
};
struct SetDataSlot {
  std::uint8_t subscription = 0;
};
struct SetLoad {
  double share = 0.5;  // 0 to 1 of the cells' capacity that others use
};
struct StallData {
  std::uint8_t subscription = 0;
  double seconds = 20;
  bool isDnsFailure = false;
};
struct MetricTraffic {
  event::CueKind kind = event::CueKind::Burst;
  std::uint32_t count = 1;
  std::uint32_t bytes = 0;
};
using Action =
    std::variant<PlaceCall, UseData, SetScreen, SetAirplane, SetSim, SetDataSlot, SetLoad, StallData, MetricTraffic>;
}  // namespace action

struct ScriptStep {
  SimulatedMs atMs = 0;
  SimulatedMs everyMs = 0;  // again after this long; 0: once
  action::Action action;
};

struct Scenario {
  std::string name;
  std::string about;
  Environment environment = Environment::UrbanMacro;
  double load = 0.4;  // share of the cells' capacity that others use
  std::vector<Operator> operators;
  std::vector<Layer> layers;
  std::vector<Site> sites;
  std::vector<Zone> zones;
  std::vector<CdmaStation> cdmaStations;
  std::vector<Waypoint> route;  // at least one
  RouteEnd routeEnd = RouteEnd::Stop;
  std::array<Sim, 2> sims;
  std::vector<ScriptStep> steps;  // in the order of the file
};

}  // namespace quorl::simulator::network
