#pragma once

#include <span>
#include <string_view>

// The schema of all message classes as text, made from its files when the tool is built: the files' own words, comments
// included, without the options that only the generator of our classes understands.

namespace quorl::tool {

/// A message or an enumeration at the top level of a file.
struct SchemaDefinition {
  std::string_view name;
  std::string_view text;                 // ends with a line break
  std::span<const unsigned short> uses;  // indices of the definitions that its fields refer to, each once
};

/// The definitions of one file, which follow each other in the list of all.
struct SchemaFile {
  std::string_view comment;  // what the file says of itself; ends with a line break
  unsigned short first;
  unsigned short count;
};

std::span<const SchemaDefinition> schemaDefinitions();
std::span<const SchemaFile> schemaFiles();

/// What a file needs ahead of any definitions.
std::string_view schemaHead();

}  // namespace quorl::tool
