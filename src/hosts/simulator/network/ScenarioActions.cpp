#include "hosts/simulator/network/ScenarioActions.h"

#include <string>

namespace quorl::simulator::network {
namespace {

constexpr double kLongest = 86400;  // seconds

std::uint8_t slotSetting(ScenarioLine& line) {
  return static_cast<std::uint8_t>(line.wholeSetting("slot", 1, 1, 2) - 1);
}

bool choice(ScenarioLine& line, std::string_view yes, std::string_view no) {
  const std::string what = std::string(yes) + " or " + std::string(no);
  const std::string word = line.word(what);
  if (word != yes && word != no) throw BadScenarioLine("must be {}: {}", what, word);
  return word == yes;
}

action::PlaceCall placeCall(ScenarioLine& line) {
  action::PlaceCall call;
  call.isOutgoing = choice(line, "out", "in");
  call.subscription = slotSetting(line);
  call.talkSeconds = line.numberSetting("talk", 60, 0.1, kLongest);
  call.isAnswered = !line.flag("unanswered");
  return call;
}

action::StallData stallData(ScenarioLine& line) {
  action::StallData stall;
  stall.subscription = slotSetting(line);
  stall.seconds = line.numberSetting("seconds", 20, 0.1, kLongest);
  stall.isDnsFailure = line.flag("dns");
  return stall;
}

action::SetSim setSim(ScenarioLine& line) {
  action::SetSim sim;
  sim.isPresent = choice(line, "in", "out");
  sim.subscription = slotSetting(line);
  return sim;
}

action::MetricTraffic traffic(ScenarioLine& line, event::CueKind kind) {
  action::MetricTraffic result;
  result.kind = kind;
  result.count = static_cast<std::uint32_t>(line.whole("count", 1, 1000000));
  if (kind == event::CueKind::Oversized)
    result.bytes = static_cast<std::uint32_t>(line.wholeSetting("bytes", 1 << 20, 1, 64 << 20));
  return result;
}

}  // namespace

action::Action takeAction(ScenarioLine& line) {
  const std::string word = line.word("what happens");
  if (word == "call") return placeCall(line);
  if (word == "data") return action::UseData{slotSetting(line), line.numberSetting("seconds", 10, 0.1, kLongest)};
  if (word == "screen") return action::SetScreen{choice(line, "on", "off")};
  if (word == "airplane") return action::SetAirplane{choice(line, "on", "off")};
  if (word == "sim") return setSim(line);
  if (word == "data-slot") return action::SetDataSlot{static_cast<std::uint8_t>(line.whole("slot", 1, 2) - 1)};
  if (word == "load") return action::SetLoad{line.number("load", 0, 100) / 100.0};
  if (word == "stall") return stallData(line);
  if (word == "malformed") return traffic(line, event::CueKind::Malformed);
  if (word == "oversized") return traffic(line, event::CueKind::Oversized);
  if (word == "burst") return traffic(line, event::CueKind::Burst);
  throw BadScenarioLine("nothing happens by that name: {}", word);
}

std::optional<std::uint8_t> slotOf(const action::Action& action) {
  return std::visit(
      [](const auto& value) -> std::optional<std::uint8_t> {
        if constexpr (requires { value.subscription; }) return value.subscription;
        return std::nullopt;
      },
      action);
}

}  // namespace quorl::simulator::network
