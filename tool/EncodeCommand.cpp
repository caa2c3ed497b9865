#include <cstddef>
#include <iostream>
#include <memory>
#include <string>

#include <fmt/format.h>

#include "Commands.h"
#include "Hexadecimal.h"
#include "InputLines.h"
#include "MessageClass.h"
#include "MessageJson.h"
#include "messages/wire/WireWriter.h"

namespace quorl::tool {
namespace {

tl::expected<std::string, std::string> encodeLine(const MessageTable& table, const std::string& line) {
  const std::unique_ptr<MetricCodable> message(table.make());
  if (auto filled = fillFromJson(*message, line); !filled) return tl::unexpected(std::move(filled.error()));
  WireWriter writer;
  message->writeTo(writer);
  return hexText(writer.bytes());
}

int encode(const std::string& className) {
  const MessageTable* table = messageClass(className);
  if (table == nullptr) return kWrongUse;
  int exitCode = kSuccess;
  const bool isWhole = forEachInputLine([&](std::size_t number, const std::string& line) {
    if (const auto payload = encodeLine(*table, line)) {
      std::cout << *payload << '\n';
    } else {
      complain(fmt::format("line {}: {}", number, payload.error()));
      exitCode = kFailure;
    }
  });
  return isWhole ? exitCode : kFailure;
}

}  // namespace

void addEncode(CommandLine& tool) {
  Command command = tool.addCommand("encode", "Write payloads from JSON");
  command.setFooter(
      "The other way round from decode: reads one message a line as JSON, in the form that decode prints, and prints\n"
      "its payload in hexadecimal. A line that is no such message is reported and left out, and makes the exit code "
      "1.");
  auto className = std::make_shared<std::string>();
  command.addOption("--class", *className, "Message class, such as KCellularEmmContext").required();
  command.setAction([className] { return encode(*className); });
}

}  // namespace quorl::tool
