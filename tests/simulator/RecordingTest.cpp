#include <limits>
#include <optional>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

#include "hosts/simulator/Base64.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/RecordingWriter.h"
#include "platform/ZelkorClient.h"
#include "support/TemporaryDirectory.h"

namespace quorl::simulator {
namespace {

std::string faultOf(std::string_view line) {
  const auto event = parseRecordingLine(line);
  return event ? "none" : event.error();
}

TEST(Base64, ReadsBackEveryLengthAndEveryByte) {
  std::string bytes;
  for (int length = 0; length <= 260; ++length) {
    const std::string text = base64Text(bytes);
    EXPECT_EQ(text.size() % 4, 0U);
    EXPECT_EQ(base64Bytes(text), bytes) << length;
    bytes.push_back(static_cast<char>(length * 7));
  }
}

TEST(Base64, WritesTheKnownTexts) {
  EXPECT_EQ(base64Text(""), "");
  EXPECT_EQ(base64Text("f"), "Zg==");
  EXPECT_EQ(base64Text("fo"), "Zm8=");
  EXPECT_EQ(base64Text("foobar"), "Zm9vYmFy");
  EXPECT_EQ(base64Text("\xfb\xff\xfe"), "+//+");
}

TEST(Base64, RefusesWhatIsNotExactlyBase64) {
  for (const char* text : {"Zg", "Zg=", "Z", "=", "====", "Zg==Zg==", "Z===", "Zm9v\n", "Zm9v YmFy", "Zm-v", "Zm_v",
                           "Zm9\xc3", "Z=g=", "Zh==", "Zm9="})
    EXPECT_EQ(base64Bytes(text), std::nullopt) << text;
  EXPECT_EQ(base64Bytes(std::string("Zm9\0", 4)), std::nullopt);
}

TEST(RecordingLine, HoldsTheIncomingKeysOfAnEvent) {
  const auto event = parseRecordingLine(
      R"({"kKeyMetricID":806915,"kKeyPayload":"COgH","kKeyTriggerRef":9999,"kKeyProfileID":0,"kKeyAppID":2})");
  ASSERT_TRUE(event) << event.error();
  EXPECT_EQ(event->metricID, 806915);
  EXPECT_EQ(event->payload, ByteString("\x08\xe8\x07"));
  EXPECT_EQ(event->triggerRef, 9999);
  EXPECT_EQ(event->profileID, 0);
  EXPECT_EQ(event->appID, 2);
  EXPECT_EQ(event->atMs, std::nullopt);

  const zelkor::KeyValueMessage message = event->message();
  EXPECT_EQ(message.entries().size(), 5U);
  EXPECT_EQ(message.integer(zelkor::kKeyMetricID), 806915);
  EXPECT_EQ(message.bytes(zelkor::kKeyPayload), ByteString("\x08\xe8\x07"));
}

TEST(RecordingLine, MayLackAnyKey) {
  const auto empty = parseRecordingLine("{}");
  ASSERT_TRUE(empty);
  EXPECT_EQ(*empty, RecordedEvent{});
  EXPECT_TRUE(empty->message().entries().empty());

  const auto payloadOnly = parseRecordingLine(R"({"kKeyPayload":""})");
  ASSERT_TRUE(payloadOnly);
  EXPECT_EQ(payloadOnly->payload, ByteString());
  EXPECT_EQ(payloadOnly->message().entries().size(), 1U);
}

TEST(RecordingLine, MayTellItsTimeWhichStaysOffTheChannel) {
  const auto event = parseRecordingLine(R"({"atMs":1500,"kKeyMetricID":1})");
  ASSERT_TRUE(event);
  EXPECT_EQ(event->atMs, 1500U);
  EXPECT_EQ(event->message().entries().size(), 1U);
}

TEST(RecordingLine, TakesTheWholeRangeOfTheChannelsIntegers) {
  EXPECT_EQ(parseRecordingLine(R"({"kKeyMetricID":-9223372036854775808})")->metricID,
            std::numeric_limits<std::int64_t>::min());
  EXPECT_EQ(parseRecordingLine(R"({"kKeyMetricID":9223372036854775807})")->metricID,
            std::numeric_limits<std::int64_t>::max());
  EXPECT_EQ(faultOf(R"({"kKeyMetricID":9223372036854775808})"), "kKeyMetricID is no integer of 64 bits");
}

TEST(RecordingLine, SaysWhyItIsNoEvent) {
  EXPECT_EQ(faultOf(""), "not JSON");
  EXPECT_EQ(faultOf("   "), "not JSON");
  EXPECT_EQ(faultOf("{"), "not JSON");
  EXPECT_EQ(faultOf("{} {}"), "not JSON");
  EXPECT_EQ(faultOf("{\"kKeyAppID\":2,}"), "not JSON");
  EXPECT_EQ(faultOf("{\"\xff\":1}"), "not JSON");
  EXPECT_EQ(faultOf("[]"), "no JSON object");
  EXPECT_EQ(faultOf("806915"), "no JSON object");
  EXPECT_EQ(faultOf("null"), "no JSON object");
  EXPECT_EQ(faultOf(R"({"kKeyMetricID":"806915"})"), "kKeyMetricID is no integer of 64 bits");
  EXPECT_EQ(faultOf(R"({"kKeyMetricID":1.5})"), "kKeyMetricID is no integer of 64 bits");
  EXPECT_EQ(faultOf(R"({"kKeyMetricID":null})"), "kKeyMetricID is no integer of 64 bits");
  EXPECT_EQ(faultOf(R"({"kKeyMetricID":true})"), "kKeyMetricID is no integer of 64 bits");
  EXPECT_EQ(faultOf(R"({"kKeyPayload":"08 E8 07"})"), "kKeyPayload is no base64 text");
  EXPECT_EQ(faultOf(R"({"kKeyPayload":[8]})"), "kKeyPayload is no base64 text");
  EXPECT_EQ(faultOf(R"({"atMs":-1})"), "atMs is no whole number of milliseconds");
  EXPECT_EQ(faultOf(R"({"metricID":806915})"), "there is no key \"metricID\"");
}

TEST(RecordingLine, NestedWithoutEndIsNoEvent) {
  EXPECT_EQ(faultOf(std::string(200000, '[')), "not JSON");
  EXPECT_EQ(faultOf(R"({"kKeyPayload":)" + std::string(100000, '[') + std::string(100000, ']') + "}"),
            "kKeyPayload is no base64 text");
}

TEST(RecordingLine, ReadsBackAsItWasWritten) {
  RecordedEvent event;
  EXPECT_EQ(recordingLine(event), "{}");
  event.metricID = 3986700;
  event.payload = ByteString(std::string_view("\0\xff\x08", 3));
  event.triggerRef = 9999;
  event.profileID = -1;
  event.appID = 2;
  event.atMs = 600000;
  EXPECT_EQ(recordingLine(event), R"({"atMs":600000,"kKeyMetricID":3986700,"kKeyPayload":"AP8I","kKeyTriggerRef":9999,)"
                                  R"("kKeyProfileID":-1,"kKeyAppID":2})");
  EXPECT_EQ(parseRecordingLine(recordingLine(event)), event);
}

TEST(RecordingFile, LeavesOutBadLinesAndGoesOn) {
  std::istringstream input("{\"kKeyMetricID\":1}\r\n\nnonsense\n{\"kKeyMetricID\":2}\n{\"kKeyMetricID\":3}");
  const Recording recording = readRecording(input);
  ASSERT_EQ(recording.events.size(), 3U);
  EXPECT_EQ(recording.events[0].metricID, 1);
  EXPECT_EQ(recording.events[1].metricID, 2);
  EXPECT_EQ(recording.events[2].metricID, 3);
  ASSERT_EQ(recording.faults.size(), 2U);
  EXPECT_EQ(recording.faults[0].line, 2U);
  EXPECT_EQ(recording.faults[1].line, 3U);
}

TEST(RecordingFile, EmptyFileIsAnEmptyRecording) {
  std::istringstream input;
  const Recording recording = readRecording(input);
  EXPECT_TRUE(recording.events.empty());
  EXPECT_TRUE(recording.faults.empty());
}

TEST(RecordingFile, ThatCannotBeReadSaysWhy) {
  const test::TemporaryDirectory directory;
  const auto missing = readRecording(directory.path() / "missing.jsonl");
  ASSERT_FALSE(missing);
  EXPECT_EQ(missing.error(), "No such file or directory");
  const auto folder = readRecording(directory.path());
  ASSERT_FALSE(folder);
  EXPECT_EQ(folder.error(), "is a directory");
}

TEST(RecordingWriter, AFullDiskIsToldAtTheEnd) {
  auto writer = RecordingWriter::open("/dev/full");
  ASSERT_TRUE(writer);
  RecordedEvent event;
  event.metricID = 803010;
  event.payload = ByteString(std::string(100000, 'x'));
  for (int i = 0; i < 3; ++i) writer->write(event);
  const auto closed = writer->close();
  ASSERT_FALSE(closed);
  EXPECT_EQ(closed.error(), "No space left on device");
}

}  // namespace
}  // namespace quorl::simulator
