#include "hosts/simulator/TelephonyScript.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <fstream>
#include <initializer_list>
#include <system_error>
#include <utility>

#include <fmt/format.h>
#include <nlohmann/json.hpp>

#include "hosts/simulator/JsonNumber.h"

namespace quorl::simulator {
namespace {

using OrderedJson = nlohmann::ordered_json;  // cell dictionaries keep their order
namespace event = telephony_event;

constexpr std::int64_t kLongestMs = std::int64_t{30} * 24 * 60 * 60 * 1000;

struct BadLine {
  std::string reason;
};

template <typename... Args>
[[noreturn]] void bad(fmt::format_string<Args...> format, Args&&... args) {
  throw BadLine{fmt::format(format, std::forward<Args>(args)...)};
}

template <typename Enum>
using Names = std::initializer_list<std::pair<std::string_view, Enum>>;

/// The fields of one line. Each is asked for once; what nobody asked for is a mistake of the writer.
class Fields {
 public:
  explicit Fields(const OrderedJson& line) : line_(line) {}

  /// Null for a field that is left out.
  const OrderedJson* find(const char* name) {
    asked_.emplace_back(name);
    const auto found = line_.find(name);
    return found == line_.end() ? nullptr : &*found;
  }

  const OrderedJson& need(const char* name) {
    const OrderedJson* value = find(name);
    if (value == nullptr) bad("{} is missing", name);
    return *value;
  }

  std::int64_t number(const char* name) {
    const auto value = integer(need(name));
    if (!value) bad("{} must be a whole number", name);
    return *value;
  }

  std::string text(const char* name) {
    const OrderedJson& value = need(name);
    if (!value.is_string()) bad("{} must be a text", name);
    return value.get<std::string>();
  }

  bool boolean(const char* name) {
    const OrderedJson& value = need(name);
    if (!value.is_boolean()) bad("{} must be true or false", name);
    return value.get<bool>();
  }

  HVSubscriptionSlot slot() {
    const std::int64_t value = number("slot");
    if (value != 1 && value != 2) bad("slot must be 1 or 2");
    return static_cast<HVSubscriptionSlot>(value);
  }

  template <typename Enum>
  Enum oneOf(const char* name, Names<Enum> names) {
    const std::string value = text(name);
    for (const auto& [known, meaning] : names)
      if (known == value) return meaning;
    bad("{} \"{}\" is not known", name, value);
  }

  void finish() const {
    for (const auto& [name, value] : line_.items())
      if (std::find(asked_.begin(), asked_.end(), name) == asked_.end()) bad("field \"{}\" is not known", name);
  }

 private:
  const OrderedJson& line_;
  std::vector<std::string> asked_;
};

HVCellValue cellValue(const std::string& key, const OrderedJson& value) {
  if (value.is_string()) return value.get<std::string>();
  if (value.is_number_integer()) {
    const auto number = integer(value);
    if (!number) bad("\"{}\" is too large", key);
    return *number;
  }
  return HVUnknownValue{value.type_name()};
}

HVCellInfo cellInfo(const OrderedJson& value) {
  HVCellInfo info;
  if (value.is_null()) return info;
  if (!value.is_object()) bad("info must be an object or null");
  HVCellDictionary cell;
  for (const auto& [key, entry] : value.items()) cell.emplace_back(key, cellValue(key, entry));
  info.legacyInfo.emplace().emplace_back(std::move(cell));
  return info;
}

std::optional<HVBandDictionary> bands(const char* name, const OrderedJson* value) {
  if (value == nullptr || value->is_null()) return std::nullopt;
  if (!value->is_object()) bad("{} must be an object or null", name);
  HVBandDictionary result;
  for (const auto& [technology, list] : value->items()) {
    if (!list.is_array()) bad("{} of \"{}\" must be a list", name, technology);
    std::vector<std::int64_t> numbers;
    for (const OrderedJson& entry : list) {
      const auto number = integer(entry);
      if (!number) bad("{} of \"{}\" must hold whole numbers", name, technology);
      numbers.push_back(*number);
    }
    result.emplace_back(technology, std::move(numbers));
  }
  return result;
}

std::optional<std::string> optionalText(const char* name, const OrderedJson* value) {
  if (value == nullptr || value->is_null()) return std::nullopt;
  if (!value->is_string()) bad("{} must be a text or null", name);
  return value->get<std::string>();
}

event::Event simInserted(Fields& fields) {
  return event::SimInserted{fields.slot(), optionalText("carrier", fields.find("carrier"))};
}

event::Event simRemoved(Fields& fields) {
  return event::SimRemoved{fields.slot()};
}

event::Event carrierName(Fields& fields) {
  return event::CarrierName{fields.slot(), optionalText("name", &fields.need("name"))};
}

event::Event carrierMap(Fields& fields) {
  return event::CarrierMap{fields.boolean("present")};
}

event::Event cell(Fields& fields) {
  event::Cell result{fields.slot(), cellInfo(fields.need("info")), true};
  if (fields.find("update") != nullptr) result.isUpdate = fields.boolean("update");
  return result;
}

event::Event signal(Fields& fields) {
  event::Signal result{fields.slot(), std::nullopt};
  if (!fields.need("rsrp").is_null()) result.rsrp = fields.number("rsrp");
  return result;
}

event::Event bandRecord(Fields& fields) {
  return event::Bands{fields.slot(),
                      HVBandInfo{bands("active", fields.find("active")), bands("supported", fields.find("supported"))}};
}

event::Failure failure(Fields& fields) {
  event::Failure result;
  result.what = fields.oneOf<event::Service>("what", {{"subscriptions", event::Service::Subscriptions},
                                                      {"cell", event::Service::Cell},
                                                      {"signal", event::Service::Signal},
                                                      {"bands", event::Service::Bands}});
  if (result.what != event::Service::Subscriptions) result.slot = fields.slot();
  return result;
}

event::Event fail(Fields& fields) {
  event::Failure result = failure(fields);
  result.error = HVError{fields.text("error")};
  return result;
}

event::Event recover(Fields& fields) {
  return failure(fields);
}

event::Event connection(Fields& fields) {
  using Type = HVDataConnectionType;
  using Status = HVDataConnectionStatus;
  event::Connection result;
  result.slot = fields.slot();
  result.type = fields.oneOf<Type>(
      "type", {{"Default", Type::Default}, {"Internet", Type::Internet}, {"Ims", Type::Ims}, {"Other", Type::Other}});
  result.status = fields.oneOf<Status>("status", {{"Unknown", Status::Unknown},
                                                  {"Disconnected", Status::Disconnected},
                                                  {"Connecting", Status::Connecting},
                                                  {"Connected", Status::Connected},
                                                  {"Disconnecting", Status::Disconnecting}});
  return result;
}

using EventReader = event::Event (*)(Fields&);

TelephonyScriptStep readLine(const std::string& line) {
  const OrderedJson json = OrderedJson::parse(line, nullptr, /*allow_exceptions=*/false);
  if (json.is_discarded()) bad("no JSON");
  if (!json.is_object()) bad("no JSON object");
  Fields fields(json);
  const std::int64_t atMs = fields.number("atMs");
  if (atMs < 0 || atMs > kLongestMs) bad("atMs must be between 0 and {}", kLongestMs);
  const auto read = fields.oneOf<EventReader>("event", {{"simInserted", simInserted},
                                                        {"simRemoved", simRemoved},
                                                        {"carrierName", carrierName},
                                                        {"carrierMap", carrierMap},
                                                        {"cell", cell},
                                                        {"signal", signal},
                                                        {"bands", bandRecord},
                                                        {"fail", fail},
                                                        {"recover", recover},
                                                        {"connection", connection}});
  TelephonyScriptStep step{std::chrono::milliseconds(atMs), read(fields)};
  fields.finish();
  return step;
}

}  // namespace

std::string logText(const TelephonyScriptProblem& problem) {
  return fmt::format("{}:{}: {}", problem.file, problem.line, problem.reason);
}

TelephonyScript readTelephonyScript(std::istream& input, std::string_view name) {
  TelephonyScript script;
  std::size_t number = 0;
  for (std::string line; std::getline(input, line);) {
    ++number;
    if (line.find_first_not_of(" \t\r") == std::string::npos) continue;
    try {
      script.steps.push_back(readLine(line));
    } catch (const BadLine& problem) {
      script.problems.push_back({std::string(name), number, problem.reason});
    }
  }
  if (input.bad()) script.problems.push_back({std::string(name), 0, "cannot be read to its end"});
  std::stable_sort(
      script.steps.begin(), script.steps.end(),
      [](const TelephonyScriptStep& left, const TelephonyScriptStep& right) { return left.at < right.at; });
  return script;
}

TelephonyScript readTelephonyScript(const std::filesystem::path& file) {
  const std::string name = file.filename().string();
  std::ifstream input(file, std::ios::binary);
  if (!input) {
    TelephonyScript script;
    script.problems.push_back({name, 0, "cannot be opened: " + std::generic_category().message(errno)});
    return script;
  }
  return readTelephonyScript(input, name);
}

}  // namespace quorl::simulator
