#include <cstddef>
#include <iostream>
#include <memory>
#include <optional>
#include <string>

#include <fmt/format.h>

#include "Commands.h"
#include "Hexadecimal.h"
#include "InputLines.h"
#include "MessageClass.h"
#include "MessageJson.h"

namespace quorl::tool {
namespace {

int decode(const std::string& className) {
  const MessageTable* table = messageClass(className);
  if (table == nullptr) return kWrongUse;
  int exitCode = kSuccess;
  const bool isWhole = forEachInputLine([&](std::size_t number, const std::string& line) {
    std::optional<MetricDictionary> result;
    if (const auto payload = hexBytes(line)) {
      const std::unique_ptr<MetricCodable> message(table->make());
      message->initWithData(ByteString(*payload));
      result = message->dictionaryRepresentation();
    } else {
      complain(fmt::format("line {}: not hexadecimal", number));
      exitCode = kFailure;
    }
    std::cout << messageLine(result) << '\n';
  });
  return isWhole ? exitCode : kFailure;
}

}  // namespace

void addDecode(CommandLine& tool) {
  Command command = tool.addCommand("decode", "Read payloads and print them as JSON");
  command.setFooter(
      "Reads one payload a line in hexadecimal from standard input and prints a line for each: the metric dictionary,\n"
      "or null when the payload cannot be read whole. A line that is not hexadecimal prints null too, is reported,\n"
      "and makes the exit code 1.");
  auto className = std::make_shared<std::string>();
  command.addOption("--class", *className, "Message class, such as KCellularEmmContext").required();
  command.setAction([className] { return decode(*className); });
}

}  // namespace quorl::tool
