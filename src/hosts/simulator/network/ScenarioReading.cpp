#include "hosts/simulator/network/ScenarioReading.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <fstream>
#include <optional>
#include <system_error>
#include <utility>

#include <fmt/format.h>

#include "hosts/simulator/network/Bands.h"
#include "hosts/simulator/network/ScenarioActions.h"
#include "hosts/simulator/network/ScenarioLine.h"

namespace quorl::simulator::network {
namespace {

constexpr double kFarthest = 1e6;  // metres
constexpr std::size_t kMostCells = 5000;
constexpr std::size_t kMostProblems = 100;
constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

template <typename Value, std::size_t Count>
Value oneOf(const std::string& word, std::string_view what,
            const std::array<std::pair<std::string_view, Value>, Count>& names) {
  std::string allowed;
  for (const auto& [name, value] : names) {
    if (name == word) return value;
    allowed += (allowed.empty() ? "" : ", ") + std::string(name);
  }
  throw BadScenarioLine("{} must be one of {}: {}", what, allowed, word);
}

/// Takes the lines of one file.
class Builder {
 public:
  explicit Builder(Scenario& scenario) : scenario_(scenario) {}

  void take(ScenarioLine line) {
    const std::string keyword = line.word("a keyword");
    using Taker = void (Builder::*)(ScenarioLine&);
    constexpr std::array<std::pair<std::string_view, Taker>, 14> kTakers{{
        {"about", &Builder::about},
        {"environment", &Builder::environment},
        {"load", &Builder::load},
        {"network", &Builder::network},
        {"layer", &Builder::layer},
        {"site", &Builder::site},
        {"grid", &Builder::grid},
        {"zone", &Builder::zone},
        {"cdma", &Builder::cdma},
        {"route", &Builder::route},
        {"point", &Builder::point},
        {"sim", &Builder::sim},
        {"at", &Builder::at},
        {"every", &Builder::every},
    }};
    const Taker taker = oneOf(keyword, "the first word", kTakers);
    (this->*taker)(line);
    line.finish();
  }

  /// What is wrong with the whole, if anything.
  std::vector<std::string> finish() const {
    std::vector<std::string> problems;
    const auto check = [&](bool isFine, std::string reason) {
      if (!isFine) problems.push_back(std::move(reason));
    };
    check(!scenario_.operators.empty(), "no network");
    check(!scenario_.sites.empty(), "no site");
    check(!scenario_.route.empty(), "no point of the route");
    check(scenario_.sims[0].isPresent || scenario_.sims[1].isPresent, "no sim");
    if (scenario_.routeEnd == RouteEnd::Loop && scenario_.route.size() > 1)
      check(scenario_.route.front().metresPerSecond > 0, "a loop needs a speed at its first point, for the way back");
    for (const ScriptStep& step : scenario_.steps) {
      const auto slot = slotOf(step.action);
      if (slot && !scenario_.sims[*slot].isPresent) {
        problems.push_back(fmt::format("the script uses slot {}, which has no sim", *slot + 1));
        break;
      }
    }
    return problems;
  }

 private:
  void about(ScenarioLine& line) { scenario_.about = line.word("a text"); }

  void environment(ScenarioLine& line) {
    constexpr std::array<std::pair<std::string_view, Environment>, 3> kNames{{{"urban", Environment::UrbanMacro},
                                                                              {"street", Environment::StreetCanyon},
                                                                              {"rural", Environment::RuralMacro}}};
    scenario_.environment = oneOf(line.word("an environment"), "environment", kNames);
  }

  void load(ScenarioLine& line) { scenario_.load = line.number("load", 0, 100) / 100.0; }

  void network(ScenarioLine& line) {
    Operator added;
    added.id = line.word("a name");
    if (findOperator(added.id)) throw BadScenarioLine("network {} stands twice", added.id);
    if (scenario_.operators.size() >= 8) throw BadScenarioLine("more than 8 networks");
    const std::string code = line.word("a network code");
    const std::size_t dash = code.find('-');
    const std::size_t digits = code.size() - std::min(code.size(), dash + 1);
    if (dash != 3 || (digits != 2 && digits != 3))
      throw BadScenarioLine("a network code has 3 digits, a dash and 2 or 3 digits: {}", code);
    added.plmn.mcc = static_cast<std::uint16_t>(ScenarioLine::parseWhole(code.substr(0, 3), "country code", 1, 999));
    added.plmn.mnc = static_cast<std::uint16_t>(ScenarioLine::parseWhole(code.substr(4), "network code", 0, 999));
    added.plmn.mncDigits = static_cast<std::uint8_t>(digits);
    added.carrier = line.word("a carrier name");
    scenario_.operators.push_back(std::move(added));
  }

  void layer(ScenarioLine& line) {
    Layer added;
    added.operatorIndex = takeOperator(line);
    added.id = line.word("a layer");
    if (findLayer(added.operatorIndex, added.id)) throw BadScenarioLine("layer {} stands twice", added.id);
    constexpr std::array<std::pair<std::string_view, Technology>, 4> kNames{
        {{"gsm", Technology::Gsm}, {"umts", Technology::Umts}, {"lte", Technology::Lte}, {"nr", Technology::Nr}}};
    added.technology = oneOf(line.word("a technology"), "technology", kNames);
    const bool isGsm = added.technology == Technology::Gsm;
    const bool isUmts = added.technology == Technology::Umts;
    added.band = static_cast<std::uint16_t>(line.wholeSetting("band", std::nullopt, 1, 1900));
    added.channel = static_cast<std::uint32_t>(line.wholeSetting("channel", std::nullopt, 0, 3279165));
    const std::optional<double> width = isGsm ? std::optional(0.2) : isUmts ? std::optional(5.0) : std::nullopt;
    added.bandwidthMhzX10 = static_cast<std::uint16_t>(line.numberSetting("width", width, 0.2, 100) * 10.0 + 0.5);
    added.power = static_cast<Centi>(line.numberSetting("power", isGsm || isUmts ? 43 : 46, 0, 60) * 100.0);
    added.ports = static_cast<std::uint8_t>(line.wholeSetting("ports", isGsm || isUmts ? 1 : 2, 1, 4));
    added.beams = static_cast<std::uint8_t>(line.wholeSetting("beams", 1, 1, 8));
    added.isStandAlone = line.flag("standalone");
    if (added.isStandAlone && added.technology != Technology::Nr) throw BadScenarioLine("only nr can be standalone");
    const std::int64_t priority = isGsm ? 1 : isUmts ? 2 : added.technology == Technology::Lte ? 5 : 7;
    added.priority = static_cast<std::uint8_t>(line.wholeSetting("priority", priority, 0, 7));
    checkCarrier(added);
    scenario_.layers.push_back(std::move(added));
  }

  static void checkCarrier(const Layer& layer) {
    // GSM sectors take every other of the next 24 channels.
    const std::uint32_t last = layer.channel + (layer.technology == Technology::Gsm ? 22U : 0U);
    const auto found = frequencies(layer.technology, layer.band, layer.channel);
    if (!found || !frequencies(layer.technology, layer.band, last))
      throw BadScenarioLine("channel {} does not belong to band {}", layer.channel, layer.band);
    if (!resourceBlocks(layer.technology, layer.bandwidthMhzX10, found->isTdd))
      throw BadScenarioLine("no carrier is {} MHz wide there", layer.bandwidthMhzX10 / 10.0);
  }

  /// What site and grid have in common, place aside.
  Site siteSettings(ScenarioLine& line, std::uint8_t operatorIndex) {
    Site site;
    site.operatorIndex = operatorIndex;
    site.height = line.numberSetting("height", 25, 3, 150);
    site.areaCode = static_cast<std::uint32_t>(line.wholeSetting("area", std::nullopt, 1, 65533));
    for (const std::string& id : line.listSetting("layers")) {
      const auto layer = findLayer(operatorIndex, id);
      if (!layer) throw BadScenarioLine("no layer of that name in this network: {}", id);
      site.layers.push_back(*layer);
    }
    if (site.layers.empty()) throw BadScenarioLine("layers= is missing");
    const std::string sectors = line.setting("sectors").value_or("0,120,240");
    if (sectors == "none") return site;
    for (std::string_view rest = sectors;;) {
      const std::size_t comma = rest.find(',');
      site.azimuths.push_back(
          static_cast<std::uint16_t>(ScenarioLine::parseWhole(rest.substr(0, comma), "sectors", 0, 359)));
      if (comma == std::string_view::npos) break;
      rest.remove_prefix(comma + 1);
    }
    if (site.azimuths.size() > 6) throw BadScenarioLine("more than 6 sectors");
    return site;
  }

  void addSite(const Site& site) {
    cells_ += site.layers.size() * std::max<std::size_t>(1, site.azimuths.size());
    if (cells_ > kMostCells) throw BadScenarioLine("more than {} cells", kMostCells);
    scenario_.sites.push_back(site);
  }

  void site(ScenarioLine& line) {
    const std::uint8_t number = takeOperator(line);
    const double x = line.number("x", -kFarthest, kFarthest);
    const double y = line.number("y", -kFarthest, kFarthest);
    Site added = siteSettings(line, number);
    added.x = x;
    added.y = y;
    addSite(added);
  }

  void grid(ScenarioLine& line) {
    const std::uint8_t number = takeOperator(line);
    const double x = line.number("x", -kFarthest, kFarthest);
    const double y = line.number("y", -kFarthest, kFarthest);
    const auto columns = line.wholeSetting("columns", std::nullopt, 1, 200);
    const auto rows = line.wholeSetting("rows", std::nullopt, 1, 200);
    const double spacing = line.numberSetting("spacing", std::nullopt, 20, 50000);
    const auto areas = line.wholeSetting("areas", 1, 1, columns);
    Site added = siteSettings(line, number);
    const std::uint32_t firstArea = added.areaCode;
    for (std::int64_t row = 0; row < rows; ++row) {
      for (std::int64_t column = 0; column < columns; ++column) {
        // Hexagons: every other row stands half a step aside, rows are sqrt(3)/2 apart.
        added.x = x + spacing * (static_cast<double>(column) + (row % 2 == 0 ? 0.0 : 0.5));
        added.y = y + spacing * 0.8660254037844386 * static_cast<double>(row);
        added.areaCode = firstArea + static_cast<std::uint32_t>(column * areas / columns);
        addSite(added);
      }
    }
  }

  void zone(ScenarioLine& line) {
    if (scenario_.zones.size() >= kMostZones) throw BadScenarioLine("more than {} zones", kMostZones);
    Zone added;
    added.name = line.word("a name");
    added.left = line.number("left", -kFarthest, kFarthest);
    added.bottom = line.number("bottom", -kFarthest, kFarthest);
    added.right = line.number("right", -kFarthest, kFarthest);
    added.top = line.number("top", -kFarthest, kFarthest);
    if (added.left >= added.right || added.bottom >= added.top)
      throw BadScenarioLine("a zone goes from left to right and bottom to top");
    added.loss = static_cast<Centi>(line.numberSetting("loss", std::nullopt, 0, 120) * 100.0);
    scenario_.zones.push_back(std::move(added));
  }

  void cdma(ScenarioLine& line) {
    const auto field = [&](std::string_view key, std::int64_t high) {
      return static_cast<std::uint16_t>(line.wholeSetting(key, std::nullopt, 0, high));
    };
    CdmaStation added;
    added.x = line.number("x", -kFarthest, kFarthest);
    added.y = line.number("y", -kFarthest, kFarthest);
    added.metres = line.numberSetting("reach", std::nullopt, 1, kFarthest);
    added.system.mcc = field("mcc", 999);
    added.system.systemId = field("sid", 32767);
    added.system.networkId = field("nid", 65535);
    added.system.bandClass = static_cast<std::uint8_t>(field("band", 19));
    added.system.channel = field("channel", 2047);
    added.system.pilot = field("pilot", 511);
    added.system.baseId = field("base", 65535);
    scenario_.cdmaStations.push_back(added);
  }

  void route(ScenarioLine& line) {
    constexpr std::array<std::pair<std::string_view, RouteEnd>, 3> kNames{
        {{"stop", RouteEnd::Stop}, {"loop", RouteEnd::Loop}, {"return", RouteEnd::Return}}};
    scenario_.routeEnd = oneOf(line.word("what comes at its end"), "route", kNames);
  }

  void point(ScenarioLine& line) {
    Waypoint added;
    added.x = line.number("x", -kFarthest, kFarthest);
    added.y = line.number("y", -kFarthest, kFarthest);
    const bool isFirst = scenario_.route.empty();
    const std::optional<double> standing = isFirst ? std::optional(0.0) : std::nullopt;
    added.metresPerSecond = line.numberSetting("speed", standing, isFirst ? 0 : 0.1, 500) / 3.6;
    added.waitMs = static_cast<std::uint32_t>(line.numberSetting("wait", 0, 0, 86400) * 1000.0);
    scenario_.route.push_back(added);
  }

  void sim(ScenarioLine& line) {
    const auto slot = static_cast<std::size_t>(line.whole("slot", 1, 2) - 1);
    Sim& added = scenario_.sims[slot];
    if (added.isPresent) throw BadScenarioLine("slot {} has a sim already", slot + 1);
    Sim read;
    read.isPresent = true;
    read.operatorIndex = takeOperator(line);
    for (const std::string& id : line.listSetting("roaming")) read.roaming.push_back(needOperator(id));
    read.sessionsPerHour = line.numberSetting("sessions", 0, 0, 3600);
    read.sessionSeconds = line.numberSetting("length", 10, 0.1, 86400);
    read.callsPerHour = line.numberSetting("calls", 0, 0, 120);
    read.talkSeconds = line.numberSetting("talk", 60, 1, 86400);
    constexpr std::array<std::pair<std::string_view, bool>, 2> kYesNo{{{"yes", true}, {"no", false}}};
    read.hasVoiceOverLte = oneOf(line.setting("volte").value_or("yes"), "volte", kYesNo);
    added = std::move(read);
  }

  void at(ScenarioLine& line) {
    ScriptStep step;
    step.atMs = ScenarioLine::time(line.word("a time"));
    step.action = takeAction(line);
    scenario_.steps.push_back(step);
  }

  void every(ScenarioLine& line) {
    ScriptStep step;
    step.everyMs = ScenarioLine::time(line.word("a time"));
    if (step.everyMs < 100) throw BadScenarioLine("a repetition comes 0.1 s after the last at the earliest");
    const auto from = line.setting("from");
    step.atMs = from ? ScenarioLine::time(*from) : step.everyMs;
    step.action = takeAction(line);
    scenario_.steps.push_back(step);
  }

  std::optional<std::uint8_t> findOperator(std::string_view id) const {
    for (std::uint8_t number = 0; number < scenario_.operators.size(); ++number)
      if (scenario_.operators[number].id == id) return number;
    return std::nullopt;
  }
  std::uint8_t needOperator(const std::string& id) const {
    const auto found = findOperator(id);
    if (!found) throw BadScenarioLine("no network of that name: {}", id);
    return *found;
  }
  std::uint8_t takeOperator(ScenarioLine& line) const { return needOperator(line.word("a network")); }
  std::optional<std::uint16_t> findLayer(std::uint8_t operatorIndex, std::string_view id) const {
    for (std::uint16_t number = 0; number < scenario_.layers.size(); ++number)
      if (scenario_.layers[number].operatorIndex == operatorIndex && scenario_.layers[number].id == id) return number;
    return std::nullopt;
  }

  Scenario& scenario_;
  std::size_t cells_ = 0;
};

}  // namespace

std::string logText(const ScenarioProblem& problem) {
  if (problem.line == 0) return fmt::format("{}: {}", problem.file, problem.reason);
  return fmt::format("{}:{}: {}", problem.file, problem.line, problem.reason);
}

ScenarioReading readScenario(std::istream& input, std::string_view name) {
  ScenarioReading reading;
  reading.scenario.name = name.substr(0, name.rfind('.'));
  Builder builder(reading.scenario);
  const auto report = [&](std::size_t line, std::string reason) {
    reading.problems.push_back({std::string(name), line, std::move(reason)});
  };
  std::size_t number = 0;
  for (std::string text; reading.problems.size() < kMostProblems && std::getline(input, text);) {
    ++number;
    if (number == 1 && text.starts_with(kByteOrderMark)) text.erase(0, kByteOrderMark.size());
    try {
      ScenarioLine line(text);
      if (!line.isEmpty()) builder.take(std::move(line));
    } catch (const BadScenarioLine& problem) {
      report(number, problem.what());
    }
  }
  if (input.bad()) report(0, "cannot be read to its end");
  // With bad lines left out, what the whole lacks says nothing.
  if (reading.problems.empty())
    for (std::string& reason : builder.finish()) report(0, std::move(reason));
  return reading;
}

ScenarioReading readScenario(const std::filesystem::path& file) {
  ScenarioReading reading;
  const auto unreadable = [&](std::string reason) {
    reading.problems.push_back({file.string(), 0, std::move(reason)});
    return std::move(reading);
  };
  std::error_code ignored;
  if (std::filesystem::is_directory(file, ignored)) return unreadable("is a directory");
  std::ifstream input(file, std::ios::binary);
  if (!input) return unreadable("cannot be opened: " + std::generic_category().message(errno));
  reading = readScenario(input, file.filename().string());
  for (ScenarioProblem& problem : reading.problems) problem.file = file.string();
  return reading;
}

}  // namespace quorl::simulator::network
