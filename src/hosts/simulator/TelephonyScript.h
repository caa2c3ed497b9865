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
// Every line has "atMs" (whole milliseconds from the start of the run, 0 to 30 days) and "event". Lines need no order;
// lines of one time happen in the order of the file. Those of time 0 are how the phone is found at the start. Blank
// lines are skipped. The events and their fields:
//
//   simInserted   slot, carrier (text; left out or null: no name yet)    SIM comes, cell monitor update
//   simRemoved    slot                                                   SIM goes, cell monitor update
//   carrierName   slot, name (text or null)                              the carrier map's name
//   carrierMap    present (boolean)                                      whether there is a carrier map at all
//   cell          slot, info (object, or null for none),                 cell of the slot, and a cell monitor update
//                 update (boolean, true if left out)                     unless `update` is false
//   signal        slot, rsrp (dBm, or null for none)                     measurements
//   bands         slot, active, supported (object of number lists,       band record
//                 or null or left out for none)
//   fail          what, error (text), slot                               what answers with this error from now on
//   recover       what, slot                                             what answers again
//   connection    slot, type, status                                     connection state change
//
// "slot" is 1 or 2. "what" is "subscriptions" (without slot), "cell", "signal" or "bands". Entries of "info" keep the
// order of the file; whole numbers and texts stand for themselves, any other value for one of a kind that the product
// does not know. "type" is Default, Internet, Ims or Other; "status" is Unknown, Disconnected, Connecting, Connected or
// Disconnecting.

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
