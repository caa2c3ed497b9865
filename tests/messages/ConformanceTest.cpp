// Every message class against libprotobuf with the same schema: what one side writes the other reads, to the same
// content, over random messages with fixed seeds.

#include <memory>
#include <random>
#include <string>

#include <google/protobuf/stubs/logging.h>
#include <google/protobuf/unknown_field_set.h>
#include <google/protobuf/util/message_differencer.h>
#include <gtest/gtest.h>

#include "messages/KBBMetricUtility.h"
#include "messages/MessageTable.h"
#include "messages/ProtobufSide.h"
#include "messages/RandomMessage.h"
#include "messages/Wire.h"

namespace quorl {
namespace {

using google::protobuf::Message;
using google::protobuf::UnknownFieldSet;
using google::protobuf::util::MessageDifferencer;

constexpr int kRounds = 200;

class ConformanceTest : public testing::TestWithParam<const MessageTable*> {
 protected:
  const MessageTable& table() const { return *GetParam(); }

  std::unique_ptr<Message> protobufMessage() const { return test::newProtobufMessage(table().className); }

  /// Every other message is dense, so that both absent and present fields are met often.
  void fill(Message& message, int round) {
    test::fillRandomly(message, random_, {.presencePercent = round % 2 == 0 ? 90U : 30U, .maxElements = 4});
  }

  std::unique_ptr<MetricCodable> decode(const std::string& payload) const {
    return test::decoded(table().className, payload);
  }

  void expectContent(const MetricCodable& message, const Message& expected, const Message& named) const {
    const auto dictionary = message.dictionaryRepresentation();
    ASSERT_TRUE(dictionary.has_value());
    const MetricDictionary wanted = test::expectedDictionary(expected, *named.GetDescriptor());
    ASSERT_EQ(*dictionary, wanted) << logText(*dictionary) << "\n" << logText(wanted);
  }

  std::mt19937_64& random() { return random_; }

 private:
  std::mt19937_64 random_{20231121};
};

TEST_P(ConformanceTest, WhatLibprotobufWritesHasTheSameContentHere) {
  for (int round = 0; round < kRounds; ++round) {
    const auto message = protobufMessage();
    fill(*message, round);
    const auto decoded = decode(message->SerializeAsString());
    ASSERT_NO_FATAL_FAILURE(expectContent(*decoded, *message, *message));
  }
}

TEST_P(ConformanceTest, WhatIsWrittenHereHasTheSameContentThere) {
  for (int round = 0; round < kRounds; ++round) {
    const auto message = protobufMessage();
    fill(*message, round);
    const auto decoded = decode(message->SerializeAsString());
    const auto read = protobufMessage();
    ASSERT_TRUE(read->ParseFromString(test::encoded(*decoded)));
    ASSERT_TRUE(MessageDifferencer::Equals(*message, *read)) << message->ShortDebugString();
  }
}

TEST_P(ConformanceTest, ListsInTheOtherFormAndEnumerationsWithAnyNumberReadTheSame) {
  const auto named = protobufMessage();
  for (int round = 0; round < kRounds; ++round) {
    const auto message = test::OtherSender::shared().newMessage(table().className);
    fill(*message, round);
    const auto decoded = decode(message->SerializeAsString());
    ASSERT_NO_FATAL_FAILURE(expectContent(*decoded, *message, *named));
    const auto read = test::OtherSender::shared().newMessage(table().className);
    ASSERT_TRUE(read->ParseFromString(test::encoded(*decoded)));
    ASSERT_TRUE(MessageDifferencer::Equals(*message, *read)) << message->ShortDebugString();
  }
}

TEST_P(ConformanceTest, UnknownFieldsOfEveryWireTypeAreLeftOut) {
  for (int round = 0; round < kRounds / 4; ++round) {
    const auto message = protobufMessage();
    fill(*message, round);
    const std::string known = message->SerializeAsString();
    UnknownFieldSet& unknown = *message->GetReflection()->MutableUnknownFields(message.get());
    for (int tag = 2000; tag < 2003; ++tag) {
      unknown.AddVarint(tag, random()());
      unknown.AddFixed32(tag, static_cast<std::uint32_t>(random()()));
      unknown.AddFixed64(tag, random()());
      unknown.AddLengthDelimited(tag, known);
      unknown.AddGroup(tag)->AddGroup(1)->AddVarint(1, random()());
    }
    const auto decoded = decode(message->SerializeAsString());
    ASSERT_NO_FATAL_FAILURE(expectContent(*decoded, *message, *message));
  }
}

TEST_P(ConformanceTest, TruncatedPayloadsAreRefusedWhereLibprotobufRefusesThem) {
  // A debug build of libprotobuf's classes complains of each text that was cut within a character.
  const google::protobuf::LogSilencer silencer;
  for (int round = 0; round < 4; ++round) {
    const auto message = protobufMessage();
    fill(*message, round);
    const std::string payload = message->SerializeAsString();
    for (std::size_t size = 0; size < payload.size() && size < 300; ++size) {
      const std::string part = payload.substr(0, size);
      const auto read = protobufMessage();
      ASSERT_EQ(decode(part)->isReadWhole(), read->ParseFromString(part)) << "at " << size;
    }
  }
}

TEST_P(ConformanceTest, MergingFoldsLikeLibprotobuf) {
  for (int round = 0; round < kRounds / 4; ++round) {
    const auto first = protobufMessage();
    const auto second = protobufMessage();
    fill(*first, round);
    fill(*second, round + 1);
    const auto merged = decode(first->SerializeAsString());
    merged->mergeFrom(*decode(second->SerializeAsString()));
    first->MergeFrom(*second);
    ASSERT_NO_FATAL_FAILURE(expectContent(*merged, *first, *first));
  }
}

TEST_P(ConformanceTest, TablesAgreeWithTheSchema) {
  const auto message = protobufMessage();
  ASSERT_NE(message, nullptr);
  const auto& descriptor = *message->GetDescriptor();
  ASSERT_EQ(table().fields.size(), static_cast<std::size_t>(descriptor.field_count()));
  for (int i = 0; i < descriptor.field_count(); ++i) {
    const FieldEntry& field = table().fields[static_cast<std::size_t>(i)];
    EXPECT_EQ(field.key, descriptor.field(i)->name());
    EXPECT_EQ(field.tag, static_cast<std::uint32_t>(descriptor.field(i)->number()));
    EXPECT_EQ(field.isPacked, descriptor.field(i)->is_packed());
    EXPECT_EQ(table().find(field.tag), &field);
    EXPECT_EQ(field.enumeration != nullptr, descriptor.field(i)->enum_type() != nullptr);
    EXPECT_EQ(field.message != nullptr, descriptor.field(i)->message_type() != nullptr);
    if (field.enumeration == nullptr) continue;
    const auto& enumeration = *descriptor.field(i)->enum_type();
    ASSERT_EQ(field.enumeration->entries.size(), static_cast<std::size_t>(enumeration.value_count()));
    EXPECT_EQ(field.enumeration->defaultValue, enumeration.value(0)->number());
    for (int k = 0; k < enumeration.value_count(); ++k) {
      EXPECT_EQ(field.enumeration->name(enumeration.value(k)->number()), enumeration.value(k)->name());
      EXPECT_EQ(field.enumeration->value(enumeration.value(k)->name()), enumeration.value(k)->number());
    }
  }
}

INSTANTIATE_TEST_SUITE_P(, ConformanceTest, testing::ValuesIn(allMessageTables().begin(), allMessageTables().end()),
                         [](const auto& tested) { return std::string(tested.param->className); });

}  // namespace
}  // namespace quorl
