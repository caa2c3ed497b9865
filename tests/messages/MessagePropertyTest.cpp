// What must hold for every message class, over random messages with fixed seeds.

#include <algorithm>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include <google/protobuf/message.h>
#include <gtest/gtest.h>

#include "messages/MessageTable.h"
#include "messages/RandomMessage.h"
#include "messages/Wire.h"

namespace quorl {
namespace {

using test::encoded;

constexpr int kMessages = 50;

class MessagePropertyTest : public testing::TestWithParam<const MessageTable*> {
 protected:
  std::unique_ptr<MetricCodable> empty() const { return makeMessage(GetParam()->className); }

  std::string randomPayload() {
    const auto message = test::newProtobufMessage(GetParam()->className);
    test::fillRandomly(*message, random_, {.presencePercent = 60, .maxElements = 3});
    return message->SerializeAsString();
  }

  std::unique_ptr<MetricCodable> decode(const std::string& payload) const {
    return test::decoded(GetParam()->className, payload);
  }

  std::vector<std::unique_ptr<MetricCodable>> randomMessages() {
    std::vector<std::unique_ptr<MetricCodable>> messages;
    messages.push_back(empty());
    while (messages.size() < kMessages) messages.push_back(decode(randomPayload()));
    return messages;
  }

  std::mt19937_64 random_{1000};
};

TEST_P(MessagePropertyTest, DeepCopyIsEqualAndHashesTheSame) {
  for (const auto& message : randomMessages()) {
    const auto copy = message->copyWithZone();
    ASSERT_TRUE(message->isEqual(*copy));
    ASSERT_TRUE(copy->isEqual(*message));
    ASSERT_EQ(message->hash(), copy->hash());
    ASSERT_EQ(message->dictionaryRepresentation(), copy->dictionaryRepresentation());
  }
}

TEST_P(MessagePropertyTest, CopyIntoANewMessageIsEqual) {
  for (const auto& message : randomMessages()) {
    const auto target = empty();
    message->copyTo(*target);
    ASSERT_TRUE(message->isEqual(*target));
  }
}

TEST_P(MessagePropertyTest, CopyOntoAnyMessageShowsEverythingOfTheSource) {
  const auto messages = randomMessages();
  for (std::size_t i = 1; i < messages.size(); ++i) {
    messages[i]->copyTo(*messages[i - 1]);
    const auto source = *messages[i]->dictionaryRepresentation();
    const auto target = *messages[i - 1]->dictionaryRepresentation();
    for (const MetricEntry& entry : source.entries()) {
      const auto* numbers = entry.value.get<NumberList>();
      if (numbers != nullptr && numbers->bits.empty()) continue;  // an empty list leaves the target's
      ASSERT_NE(target.find(entry.key.view()), nullptr);
      ASSERT_EQ(*target.find(entry.key.view()), entry.value) << entry.key.view();
    }
  }
}

TEST_P(MessagePropertyTest, MergingAnEmptyMessageChangesNothing) {
  for (const auto& message : randomMessages()) {
    const auto before = message->copyWithZone();
    message->mergeFrom(*empty());
    ASSERT_TRUE(message->isEqual(*before));
  }
}

TEST_P(MessagePropertyTest, MergingIntoAnEmptyMessageGivesAnEqualOne) {
  for (const auto& message : randomMessages()) {
    const auto target = empty();
    target->mergeFrom(*message);
    ASSERT_TRUE(message->isEqual(*target));
  }
}

TEST_P(MessagePropertyTest, EqualityIsThatOfTheWrittenBytes) {
  const auto messages = randomMessages();
  for (std::size_t i = 1; i < messages.size(); ++i) {
    const bool isSame = encoded(*messages[i - 1]) == encoded(*messages[i]);
    ASSERT_EQ(messages[i - 1]->isEqual(*messages[i]), isSame);
    ASSERT_EQ(messages[i]->isEqual(*messages[i - 1]), isSame);
    if (isSame) {
      ASSERT_EQ(messages[i - 1]->hash(), messages[i]->hash());
    }
  }
}

TEST_P(MessagePropertyTest, WritingReadingAndWritingGivesTheSameBytes) {
  for (const auto& message : randomMessages()) {
    const std::string first = encoded(*message);
    const auto again = decode(first);
    ASSERT_TRUE(again->isReadWhole());
    ASSERT_TRUE(again->isEqual(*message));
    ASSERT_EQ(encoded(*again), first);
  }
}

TEST_P(MessagePropertyTest, KeysComeInTheOrderOfTheTableAndEveryListIsThere) {
  for (const auto& message : randomMessages()) {
    const auto dictionary = *message->dictionaryRepresentation();
    auto field = GetParam()->fields.begin();
    for (const MetricEntry& entry : dictionary.entries()) {
      field = std::find_if(field, GetParam()->fields.end(),
                           [&](const FieldEntry& candidate) { return candidate.key == entry.key.view(); });
      ASSERT_NE(field, GetParam()->fields.end()) << entry.key.view();
      ++field;
    }
    for (const FieldEntry& each : GetParam()->fields) {
      const bool isList = each.kind >= FieldKind::RepeatedUInt32;
      ASSERT_TRUE(!isList || dictionary.find(each.key) != nullptr) << each.key;
    }
  }
}

TEST_P(MessagePropertyTest, EveryDamagedPayloadIsRefusedOrReadsToSomethingThatCanBeWritten) {
  for (int round = 0; round < kMessages; ++round) {
    std::string payload = randomPayload();
    for (int damages = 1 + round % 4; damages > 0 && !payload.empty(); --damages)
      payload[random_() % payload.size()] = static_cast<char>(random_());
    const auto message = decode(payload);
    ASSERT_EQ(message->dictionaryRepresentation().has_value(), message->isReadWhole());
    const auto again = decode(encoded(*message));
    ASSERT_TRUE(again->isReadWhole());
    ASSERT_TRUE(again->isEqual(*message));
  }
}

INSTANTIATE_TEST_SUITE_P(, MessagePropertyTest, testing::ValuesIn(allMessageTables().begin(), allMessageTables().end()),
                         [](const auto& tested) { return std::string(tested.param->className); });

}  // namespace
}  // namespace quorl
