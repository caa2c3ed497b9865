#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>
#include <utility>

#include "Hexadecimal.h"
#include "MessageJson.h"
#include "hosts/simulator/Recording.h"
#include "intake/MetricGroupV2.h"
#include "messages/MessageTable.h"
#include "messages/MetricCodable.h"

// Turns recordings into seeds for the targets that take payloads, recordings or the input of the tool: fuzz_make_seeds
// FOLDER RECORDING...

namespace {

namespace fs = std::filesystem;

class Seeds {
 public:
  explicit Seeds(fs::path folder) : folder_(std::move(folder)) {}

  void add(std::string_view target, std::string_view bytes) {
    const fs::path folder = folder_ / target;
    fs::create_directories(folder);
    std::ofstream(folder / std::to_string(count_++), std::ios::binary) << bytes;
  }
  std::size_t count() const { return count_; }

 private:
  fs::path folder_;
  std::size_t count_ = 0;
};

char tableIndex(std::string_view className) {
  const auto tables = quorl::allMessageTables();
  const auto found = std::find_if(tables.begin(), tables.end(),
                                  [&](const quorl::MessageTable* table) { return table->className == className; });
  return static_cast<char>(found - tables.begin());
}

void addEvent(Seeds& seeds, const quorl::simulator::RecordedEvent& event) {
  seeds.add("RecordingLines", quorl::simulator::recordingLine(event));
  if (!event.metricID || !event.payload) return;
  const std::string payload(event.payload->view());
  seeds.add("HexadecimalInput", quorl::tool::hexText(payload));
  const auto& rows = quorl::MetricGroupV2::metricGroupData();
  for (std::size_t i = 0; i < rows.size(); ++i) {
    if (rows[i].zelkorId != *event.metricID) continue;
    const char family = rows[i].deviceType == "ice" ? 1 : 0;
    seeds.add("ProcessMetric", std::string{family, static_cast<char>(i)} + payload);
    const auto message = quorl::makeMessage(rows[i].className);
    if (!message) continue;
    const char index = tableIndex(rows[i].className);
    seeds.add("MessageReader", index + payload);
    message->initWithData(event.payload);
    if (const auto dictionary = message->dictionaryRepresentation())
      seeds.add("JsonInput", index + quorl::tool::messageLine(dictionary));
  }
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 3) {
    std::fprintf(stderr, "fuzz_make_seeds FOLDER RECORDING...\n");
    return 2;
  }
  fs::remove_all(argv[1]);
  Seeds seeds{fs::path(argv[1])};
  for (int i = 2; i < argc; ++i) {
    const auto recording = quorl::simulator::readRecording(fs::path(argv[i]));
    if (!recording) {
      std::fprintf(stderr, "%s: %s\n", argv[i], recording.error().c_str());
      return 1;
    }
    for (const auto& event : recording->events) addEvent(seeds, event);
  }
  std::printf("%zu seeds\n", seeds.count());
  return 0;
}
