#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <istream>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "platform/TelephonyClient.h"

// Telephony scripts: what happens to the simulated SIMs, and when. JSON Lines, one event a line:
//
//   {"atMs": 0, "event": "simInserted", "slot": 1, "carrier": "Testnet One"}
//
// The form is told in docs/telephony-script.md.

namespace quorl::simulator {

namespace telephony_event {

struct SimInserted {
  HVSubscriptionSlot slot = 1;
  std::optional<std::string> carrier;
};
struct SimRemoved {
  HVSubscriptionSlot slot = 1;
};
struct CarrierName {
  HVSubscriptionSlot slot = 1;
  std::optional<std::string> name;
};
struct CarrierMap {
  bool isPresent = true;
};
struct Cell {
  HVSubscriptionSlot slot = 1;
  HVCellInfo info;
  bool isUpdate = true;
};
struct Signal {
  HVSubscriptionSlot slot = 1;
  std::optional<std::int64_t> rsrp;  // dBm
};
struct Bands {
  HVSubscriptionSlot slot = 1;
  HVBandInfo bands;
};
enum class Service { Subscriptions, Cell, Signal, Bands };
/// No error: the service answers again. The slot is not looked at for `Service::Subscriptions`.
struct Failure {
  Service what = Service::Subscriptions;
  HVSubscriptionSlot slot = 1;
  std::optional<HVError> error;
};
struct Connection {
  HVSubscriptionSlot slot = 1;
  HVDataConnectionType type = HVDataConnectionType::Default;
  HVDataConnectionStatus status = HVDataConnectionStatus::Unknown;
};

using Event = std::variant<SimInserted, SimRemoved, CarrierName, CarrierMap, Cell, Signal, Bands, Failure, Connection>;

}  // namespace telephony_event

struct TelephonyScriptStep {
  std::chrono::milliseconds at{0};
  telephony_event::Event event;
};

/// A line that was left out.
struct TelephonyScriptProblem {
  std::string file;
  std::size_t line = 0;  // from 1; 0 for the file as a whole
  std::string reason;
};

/// "two-sims.jsonl:3: slot must be 1 or 2".
std::string logText(const TelephonyScriptProblem& problem);

struct TelephonyScript {
  std::vector<TelephonyScriptStep> steps;  // by time
  std::vector<TelephonyScriptProblem> problems;
};

/// Reads a script. A line that is no proper event is left out and reported under `name`, and the rest goes on. Never
/// throws.
TelephonyScript readTelephonyScript(std::istream& input, std::string_view name);
/// The same from a file. One that cannot be opened or read to its end is a problem of line 0.
TelephonyScript readTelephonyScript(const std::filesystem::path& file);

}  // namespace quorl::simulator
