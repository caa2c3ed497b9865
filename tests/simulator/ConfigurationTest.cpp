#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "hosts/simulator/Configuration.h"

namespace quorl::simulator {
namespace {

using Json = nlohmann::json;

Json wellFormed() {
  return Json::parse(R"({
    "applicationId": 2, "payloadType": 0, "profileId": 4,
    "triggers": [{"triggerId": 5, "triggerType": 0, "triggerRef": 9999}, {"triggerId": 6, "triggerType": 1, "triggerRef": 1}],
    "metrics": [806915, 803010]
  })");
}

struct Refusal {
  CommandCode code;
  std::string text;

  friend bool operator==(const Refusal&, const Refusal&) = default;
  friend void PrintTo(const Refusal& refusal, std::ostream* out) {
    *out << static_cast<int>(refusal.code) << " " << refusal.text;
  }
};

Refusal refusal(std::string_view content) {
  const auto parsed = parseConfiguration(content);
  if (parsed) return {CommandCode::Success, ""};
  return {parsed.error().code, parsed.error().text};
}

/// What comes of the well-formed configuration with one change.
template <typename Change>
Refusal after(Change change) {
  Json configuration = wellFormed();
  change(configuration);
  return refusal(configuration.dump());
}

TEST(ConfigurationOfTheManager, TellsMetricsAndTriggers) {
  const auto parsed = parseConfiguration(wellFormed().dump());
  ASSERT_TRUE(parsed) << parsed.error().text;
  EXPECT_EQ(parsed->profileId, 4);
  EXPECT_EQ(parsed->metrics, (std::vector<std::int64_t>{806915, 803010}));
  EXPECT_EQ(parsed->triggers, (std::vector<Configuration::Trigger>{{5, 0, 9999}, {6, 1, 1}}));
  EXPECT_TRUE(parsed->selects(803010));
  EXPECT_FALSE(parsed->selects(803011));
}

TEST(ConfigurationOfTheManager, ThatIsEmptyOrNoObjectIsRefused) {
  EXPECT_EQ(refusal(""), (Refusal{CommandCode::EmptyConfiguration, "the configuration is empty"}));
  for (const char* content : {"configuration", "[]", "{", "\xff\xfe", "7"})
    EXPECT_EQ(refusal(content), (Refusal{CommandCode::UnreadableConfiguration, "the configuration is no JSON object"}))
        << content;
}

TEST(ConfigurationOfTheManager, NamesEveryMissingAndEveryForeignKey) {
  for (const char* key : {"applicationId", "payloadType", "profileId", "triggers", "metrics"}) {
    EXPECT_EQ(after([key](Json& whole) { whole.erase(key); }),
              (Refusal{CommandCode::ConfigurationKey, std::string(key) + " is missing"}));
  }
  for (const char* key : {"triggerId", "triggerType", "triggerRef"}) {
    EXPECT_EQ(after([key](Json& whole) { whole["triggers"][1].erase(key); }),
              (Refusal{CommandCode::ConfigurationKey, std::string("trigger 2: ") + key + " is missing"}));
  }
  EXPECT_EQ(after([](Json& whole) { whole["metric"] = 1; }),
            (Refusal{CommandCode::ConfigurationKey, "there is no key \"metric\""}));
  EXPECT_EQ(after([](Json& whole) { whole["triggers"][0]["period"] = 1; }),
            (Refusal{CommandCode::ConfigurationKey, "trigger 1: there is no key \"period\""}));
}

TEST(ConfigurationOfTheManager, NamesEveryValueOfAnotherType) {
  for (const char* key : {"applicationId", "payloadType", "profileId"}) {
    for (const Json& wrong : {Json("2"), Json(2.5), Json(nullptr), Json(18446744073709551615U)}) {
      EXPECT_EQ(after([&](Json& whole) { whole[key] = wrong; }),
                (Refusal{CommandCode::ConfigurationKey, std::string(key) + " is no integer"}));
    }
  }
  EXPECT_EQ(after([](Json& whole) { whole["triggers"] = 5; }),
            (Refusal{CommandCode::ConfigurationKey, "triggers is no list"}));
  EXPECT_EQ(after([](Json& whole) { whole["triggers"][1] = 5; }),
            (Refusal{CommandCode::ConfigurationKey, "trigger 2: no JSON object"}));
  EXPECT_EQ(after([](Json& whole) { whole["triggers"][0]["triggerRef"] = "9999"; }),
            (Refusal{CommandCode::ConfigurationKey, "trigger 1: triggerRef is no integer"}));
  EXPECT_EQ(after([](Json& whole) { whole["metrics"] = Json::object(); }),
            (Refusal{CommandCode::ConfigurationKey, "metrics is no list"}));
  EXPECT_EQ(after([](Json& whole) { whole["metrics"][1] = "803010"; }),
            (Refusal{CommandCode::ConfigurationKey, "metric 2 of the list is no integer"}));
}

TEST(ConfigurationOfTheManager, NamesEveryValueThatItCannotServe) {
  EXPECT_EQ(after([](Json& whole) { whole["applicationId"] = 3; }),
            (Refusal{CommandCode::ConfigurationValue, "applicationId is 3 and must be 2"}));
  EXPECT_EQ(after([](Json& whole) { whole["payloadType"] = 1; }),
            (Refusal{CommandCode::ConfigurationValue, "payloadType is 1 and must be 0"}));
  EXPECT_EQ(after([](Json& whole) { whole["metrics"] = Json::array(); }),
            (Refusal{CommandCode::ConfigurationValue, "no metric is listed"}));
  EXPECT_EQ(after([](Json& whole) { whole["metrics"].push_back(806915); }),
            (Refusal{CommandCode::ConfigurationValue, "metric 806915 is listed twice"}));
  EXPECT_EQ(after([](Json& whole) { whole["metrics"].push_back(-1); }),
            (Refusal{CommandCode::ConfigurationValue, "-1 is no metric id"}));
}

TEST(ConfigurationOfTheManager, WithoutTriggersIsGood) {
  EXPECT_EQ(after([](Json& whole) { whole["triggers"] = Json::array(); }), (Refusal{CommandCode::Success, ""}));
}

}  // namespace
}  // namespace quorl::simulator
