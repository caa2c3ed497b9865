// Decoding of metric messages beside libprotobuf's generated classes of the same schema, over the same payloads, in the
// same run. Two tasks: reading alone, and reading with the dictionary that intake takes its rows from. At the end the
// ratios of the medians are printed, and the ten classes with the largest.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <random>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <google/protobuf/message.h>

#include "Medians.h"
#include "messages/MetricCodable.h"
#include "messages/RandomMessage.h"

namespace quorl {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using google::protobuf::Reflection;

/// The classes that the catalogue can decode.
constexpr const char* kClasses[] = {
    "CellularNrSysInfoBlocks",
    "CellularNrOtaMsg",
    "CellularNrScellInfo",
    "CellularNrRachAttempt",
    "CellularNrRrcState",
    "CellularNrScgAddition",
    "CellularNrScgRemoval",
    "CellularNrBeamSwitch",
    "CellularNrRrcResume",
    "CellularNrRadioLinkFailure",
    "CellularNrUlPdcpStats",
    "CellularNrEndcUsageStats",
    "CellularNrConnectionStats",
    "CellularNrSDMActivation",
    "CellularNrSdmEndcRelease",
    "CellularLqmStateChange",
    "CellularRegAttempt",
    "CellularRegisteredPlmnStatus",
    "CellularRatLacSrvInfo",
    "CellularHealthMonitor",
    "CellularCdmaCellInfo",
    "CellularGsmWcdmaCellInfo",
    "CellularWcdmaRrcState",
    "CellularLteRsrpRsrqSinrHist",
    "CellularLteRrcStateHist",
    "CellularLteRachAttempt",
    "CellularServiceStatus",
    "CellularSysOprtMode",
    "CellularSimHplmn",
    "CellularLqmDataStall",
    "CellularCallEndDetails",
    "CellularCsCallGwlPageRespFail",
    "CellularRfTunerEvent",
    "CellularLteOtaMsg",
    "CellularLteScellInfo",
    "KCellularSimCardFiles",
    "KCellularLteRrcState",
    "KCellularLteScellInfo",
    "KCellularLteServingCellMeasurement",
    "KCellularLteCarrierAggregationStatus",
    "KCellularLteCdrxConfig",
    "KCellularLteSelReselCellInfo",
    "KCellularLteComponentCarrierInfo",
    "KCellularLteTxPower",
    "KCellularWcdmaRrcConnectionState",
    "KCellularEmmContext",
    "KCellularLteNbrInterRatCellMeas",
    "KCellularLteNbrEutraCellMeas",
    "KCellularActivatedBearerContexts",
    "KCellularWcdmaRrcConfiguration",
    "KCellularWcdmaCellInfo",
    "KCellularWcdmaScellMeasurement",
    "KCellularWcdmaTxPower",
    "KCellularWcdmaSelReselCellInfo",
    "KCellularWcdmaNbrCellMeas",
    "KCellularMmContext",
    "KCellularGmmContext",
    "KCellularGsmScellInfo",
};

constexpr int kPayloadsPerClass = 32;
constexpr std::uint64_t kSeed = 20231121;
constexpr int kRepetitions = 9;
constexpr int kClassRepetitions = 5;
constexpr int kClassIterations = 2000;

struct Sample {
  std::string_view className;
  const Message* prototype;  // libprotobuf's class
  ByteString payload;
};

std::vector<Sample> samplesOf(std::string_view className) {
  static std::map<std::string_view, std::unique_ptr<Message>> prototypes;
  std::unique_ptr<Message>& prototype = prototypes[className];
  if (!prototype) prototype = test::newProtobufMessage(className);
  const test::RandomShape shape{.presencePercent = 80, .maxElements = 6, .extremePercent = 5};
  std::mt19937_64 random(kSeed);
  std::vector<Sample> samples;
  for (int i = 0; i < kPayloadsPerClass; ++i) {
    const std::unique_ptr<Message> message(prototype->New());
    test::fillRandomly(*message, random, shape);
    samples.push_back({className, prototype.get(), ByteString(message->SerializeAsString())});
  }
  return samples;
}

/// All classes, shuffled, so that no class is read twice in a row.
const std::vector<Sample>& mixedCorpus() {
  static const std::vector<Sample> corpus = [] {
    std::vector<Sample> all;
    for (const char* name : kClasses)
      for (Sample& sample : samplesOf(name)) all.push_back(std::move(sample));
    std::mt19937_64 random(kSeed);
    std::shuffle(all.begin(), all.end(), random);
    return all;
  }();
  return corpus;
}

// What one would write with libprotobuf: the generated class, and reflection into nested maps of the same content.

struct ReflectedValue;
using ReflectedMap = std::map<std::string, ReflectedValue>;
struct ReflectedValue : std::variant<std::int64_t, std::uint64_t, bool, std::string, ReflectedMap,
                                     std::vector<ReflectedMap>, std::vector<std::uint64_t>> {
  using variant::variant;
};

std::vector<std::uint64_t> reflectNumbers(const Message& message, const FieldDescriptor& field) {
  const Reflection& reflection = *message.GetReflection();
  const int count = reflection.FieldSize(message, &field);
  std::vector<std::uint64_t> numbers;
  numbers.reserve(static_cast<std::size_t>(count));
  for (int i = 0; i < count; ++i) {
    if (field.cpp_type() == FieldDescriptor::CPPTYPE_UINT32)
      numbers.push_back(reflection.GetRepeatedUInt32(message, &field, i));
    else if (field.cpp_type() == FieldDescriptor::CPPTYPE_UINT64)
      numbers.push_back(reflection.GetRepeatedUInt64(message, &field, i));
    else
      numbers.push_back(static_cast<std::uint64_t>(reflection.GetRepeatedInt32(message, &field, i)));
  }
  return numbers;
}

ReflectedMap reflect(const Message& message);

ReflectedValue reflectField(const Message& message, const FieldDescriptor& field) {
  const Reflection& reflection = *message.GetReflection();
  if (field.is_repeated()) {
    if (field.cpp_type() != FieldDescriptor::CPPTYPE_MESSAGE) return reflectNumbers(message, field);
    std::vector<ReflectedMap> list;
    const int count = reflection.FieldSize(message, &field);
    list.reserve(static_cast<std::size_t>(count));
    for (int i = 0; i < count; ++i) list.push_back(reflect(reflection.GetRepeatedMessage(message, &field, i)));
    return list;
  }
  switch (field.cpp_type()) {
    case FieldDescriptor::CPPTYPE_UINT32:
      return std::uint64_t{reflection.GetUInt32(message, &field)};
    case FieldDescriptor::CPPTYPE_UINT64:
      return reflection.GetUInt64(message, &field);
    case FieldDescriptor::CPPTYPE_INT32:
      return std::int64_t{reflection.GetInt32(message, &field)};
    case FieldDescriptor::CPPTYPE_BOOL:
      return reflection.GetBool(message, &field);
    case FieldDescriptor::CPPTYPE_ENUM:
      return reflection.GetEnum(message, &field)->name();
    case FieldDescriptor::CPPTYPE_STRING:
      return reflection.GetString(message, &field);
    default:
      return reflect(reflection.GetMessage(message, &field));
  }
}

ReflectedMap reflect(const Message& message) {
  ReflectedMap map;
  const auto& descriptor = *message.GetDescriptor();
  const Reflection& reflection = *message.GetReflection();
  for (int i = 0; i < descriptor.field_count(); ++i) {
    const FieldDescriptor& field = *descriptor.field(i);
    const bool isList = field.is_repeated() && field.cpp_type() != FieldDescriptor::CPPTYPE_MESSAGE;
    const bool isPresent =
        field.is_repeated() ? reflection.FieldSize(message, &field) > 0 : reflection.HasField(message, &field);
    if (isList || isPresent) map.emplace(field.name(), reflectField(message, field));
  }
  return map;
}

void readWithProtobuf(const Sample& sample) {
  const std::unique_ptr<Message> message(sample.prototype->New());
  benchmark::DoNotOptimize(message->ParseFromArray(sample.payload.data(), static_cast<int>(sample.payload.size())));
}

void representWithProtobuf(const Sample& sample) {
  const std::unique_ptr<Message> message(sample.prototype->New());
  message->ParseFromArray(sample.payload.data(), static_cast<int>(sample.payload.size()));
  const ReflectedMap map = reflect(*message);
  benchmark::DoNotOptimize(map.size());
}

void readWithQuorl(const Sample& sample) {
  const std::unique_ptr<MetricCodable> message = makeMessage(sample.className);
  message->initWithData(sample.payload);
  benchmark::DoNotOptimize(message->isReadWhole());
}

void representWithQuorl(const Sample& sample) {
  const std::unique_ptr<MetricCodable> message = makeMessage(sample.className);
  message->initWithData(sample.payload);
  const std::optional<MetricDictionary> dictionary = message->dictionaryRepresentation();
  benchmark::DoNotOptimize(dictionary->size());
}

using Task = void (*)(const Sample&);

/// One iteration handles one payload; the corpus is walked round and round.
void run(benchmark::State& state, const std::vector<Sample>& samples, Task task) {
  std::size_t next = 0;
  std::size_t bytes = 0;
  for (auto _ : state) {
    const Sample& sample = samples[next];
    next = next + 1 == samples.size() ? 0 : next + 1;
    task(sample);
    bytes += sample.payload.size();
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(bytes));
}

void add(const std::string& name, const std::vector<Sample>& samples, Task task) {
  benchmark::RegisterBenchmark(name.c_str(), [&samples, task](benchmark::State& state) { run(state, samples, task); })
      ->Repetitions(kRepetitions)
      ->ReportAggregatesOnly();
}

void printRatios(const bench::MedianReporter& reporter) {
  fmt::print("\nratio of medians, this engine to libprotobuf\n");
  for (const char* task : {"read", "read_and_represent"})
    if (const auto ratio = reporter.ratio(task)) fmt::print("  {:<42} {:.2f}\n", task, ratio->processor);
  std::vector<std::pair<double, std::string>> classes;
  for (const char* name : kClasses)
    if (const auto ratio = reporter.ratio(std::string("class/") + name)) classes.emplace_back(ratio->processor, name);
  std::sort(classes.rbegin(), classes.rend());
  if (classes.size() > 10) classes.resize(10);
  if (!classes.empty()) fmt::print("largest ratios by class, with dictionary\n");
  for (const auto& [ratio, name] : classes) fmt::print("  {:<42} {:.2f}\n", name, ratio);
}

}  // namespace
}  // namespace quorl

int main(int argc, char** argv) {
  using namespace quorl;
  if (!bench::initialize(argc, argv)) return 1;

  add("read/quorl", mixedCorpus(), readWithQuorl);
  add("read/protobuf", mixedCorpus(), readWithProtobuf);
  add("read_and_represent/quorl", mixedCorpus(), representWithQuorl);
  add("read_and_represent/protobuf", mixedCorpus(), representWithProtobuf);
  std::map<std::string, std::vector<Sample>> byClass;
  for (const char* name : kClasses) {
    const std::vector<Sample>& samples = byClass[name] = samplesOf(name);
    const std::pair<const char*, Task> sides[] = {{"/quorl", representWithQuorl}, {"/protobuf", representWithProtobuf}};
    for (const auto& [side, task] : sides)
      benchmark::RegisterBenchmark((std::string("class/") + name + side).c_str(),
                                   [&samples, task = task](benchmark::State& state) { run(state, samples, task); })
          ->Repetitions(kClassRepetitions)
          ->ReportAggregatesOnly()
          ->Iterations(kClassIterations);
  }
  bench::MedianReporter reporter("quorl", "protobuf");
  benchmark::RunSpecifiedBenchmarks(&reporter);
  printRatios(reporter);
  return 0;
}
