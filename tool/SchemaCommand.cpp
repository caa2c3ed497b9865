#include <algorithm>
#include <iostream>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Commands.h"
#include "MessageClass.h"
#include "schema/SchemaText.h"

namespace quorl::tool {
namespace {

void printAll() {
  std::cout << schemaHead();
  const auto definitions = schemaDefinitions();
  for (const SchemaFile& file : schemaFiles()) {
    // A comment with a blank line behind it stays one of the group, not of its first definition.
    std::cout << '\n' << file.comment;
    for (const SchemaDefinition& definition : definitions.subspan(file.first, file.count))
      std::cout << '\n' << definition.text;
  }
}

/// The class first, then what it uses, what that uses, and so on, each once.
void printClass(std::string_view name) {
  const auto definitions = schemaDefinitions();
  const auto found = std::find_if(definitions.begin(), definitions.end(),
                                  [name](const SchemaDefinition& each) { return each.name == name; });
  std::vector<std::size_t> wanted{static_cast<std::size_t>(found - definitions.begin())};
  for (std::size_t at = 0; at < wanted.size(); ++at)
    for (const unsigned short used : definitions[wanted[at]].uses)
      if (std::find(wanted.begin(), wanted.end(), used) == wanted.end()) wanted.push_back(used);
  std::cout << schemaHead();
  for (const std::size_t index : wanted) std::cout << '\n' << definitions[index].text;
}

int printSchema(const std::optional<std::string>& className) {
  if (!className) {
    printAll();
    return kSuccess;
  }
  const MessageTable* table = messageClass(*className);
  if (table == nullptr) return kWrongUse;
  printClass(table->className);
  return kSuccess;
}

}  // namespace

void addSchema(CommandLine& tool) {
  Command command = tool.addCommand("schema", "Print the message classes as Protocol Buffers schema");
  command.setFooter(
      "Prints plain .proto text that protoc compiles, so that any Protocol Buffers tool can read the payloads: all\n"
      "classes, or one with everything that it uses.");
  auto className = std::make_shared<std::optional<std::string>>();
  command.addOption("--class", *className, "Message class, such as KCellularEmmContext");
  command.setAction([className] { return printSchema(*className); });
}

}  // namespace quorl::tool
