#include "intake/IntakeFixture.h"

#include "app/HardwareManager.h"

namespace quorl::test {

void RecordingStore::insertMetric(Metric metric, WriteCompletion completion) {
  rows.push_back(std::move(metric));
  waiting_.push_back(std::move(completion));
  onInsert();
}

void RecordingStore::fetchMetricContents(std::string_view /*metricTech*/, std::string_view /*metricName*/,
                                         std::optional<std::string_view> /*attributeName*/, std::int32_t /*subsId*/,
                                         MetricsCompletion /*completion*/) {
  ADD_FAILURE() << "the intake reads nothing";
}

void RecordingStore::completesNext(bool success, std::optional<SQLiteError> error) {
  ASSERT_FALSE(waiting_.empty());
  WriteCompletion completion = std::move(waiting_.front());
  waiting_.pop_front();
  completion(success, std::move(error));
}

void RecordingStore::completesAll() {
  while (!waiting_.empty()) completesNext(true);
}

MetricDictionary dictionaryOf(Entries entries) {
  MetricDictionary dictionary;
  for (const auto& [key, value] : entries) dictionary.set(key, value);
  return dictionary;
}

MetricValue listOf(std::initializer_list<MetricDictionary> elements) {
  return MetricDictionaryList(elements);
}

MetricValue textOf(std::string_view text) {
  return Text(text);
}

MetricValue bytesOf(std::string_view bytes) {
  return ByteString(bytes);
}

MetricValue numbersOf(std::initializer_list<std::uint64_t> numbers) {
  return NumberList{numbers, /*isSigned=*/false};
}

IntakeTest::~IntakeTest() = default;

void IntakeTest::serviceStarts() {
  if (!host.properties.texts.contains("BasebandChipset")) deviceIsMav();
  HardwareManager::shared();
  service = MetricService::make(store, ZelkorWrapper::sharedInstance());
  log.clear();
}

void IntakeTest::metricArrives(std::int64_t metricId, const Payload& payload) {
  metricArrives(metricMessage(metricId, payload));
}

void IntakeTest::metricArrives(zelkor::KeyValueMessage message) {
  host.zelkor.deliver(zelkor::kEventMetric, std::move(message));
  host.time.settle();
}

zelkor::KeyValueMessage IntakeTest::metricMessage(std::int64_t metricId, const Payload& payload) {
  zelkor::KeyValueMessage message;
  message.set("kKeyMetricID", metricId);
  message.set("kKeyPayload", ByteString(payload.data()));
  return message;
}

std::vector<std::string> IntakeTest::rows(std::optional<std::string_view> metricName) const {
  std::vector<std::string> texts;
  for (const Metric& row : store.rows)
    if (!metricName || row.metricName == *metricName)
      texts.push_back(row.attributeName + "=" + row.attributeValue + " " + row.attributeValueType);
  return texts;
}

std::vector<std::string> IntakeTest::rowGroups() const {
  std::vector<std::string> groups;
  for (const Metric& row : store.rows) {
    std::string group = row.metricTech + "/" + row.metricName;
    if (groups.empty() || groups.back() != group) groups.push_back(std::move(group));
  }
  return groups;
}

std::vector<std::string> IntakeTest::unknownValueLines() const {
  std::vector<std::string> lines;
  for (const LogLine& line : log.lines()) {
    if (!line.text.starts_with("unknown attributevalue")) continue;
    EXPECT_EQ(line.category, "metric-service");
    EXPECT_EQ(line.level, LogLevel::Error);
    lines.push_back(line.text);
  }
  return lines;
}

}  // namespace quorl::test
