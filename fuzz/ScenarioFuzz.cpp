#include <chrono>
#include <cstddef>
#include <cstdint>
#include <sstream>
#include <string>
#include <utility>

#include "hosts/simulator/network/Modem.h"
#include "hosts/simulator/network/ScenarioReading.h"

// A scenario file. Whatever reads without a problem can be played.

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  namespace network = quorl::simulator::network;
  std::istringstream input(std::string(data, data + size));
  network::ScenarioReading reading = network::readScenario(input, "fuzzed.scenario");
  for (const network::ScenarioProblem& problem : reading.problems) network::logText(problem);
  if (!reading.problems.empty()) return 0;
  network::Modem modem(std::move(reading.scenario), /*seed=*/1);
  modem.advance(std::chrono::seconds(20), [](const network::ModemEvent&, const network::SubscriptionState&) {});
  return 0;
}
