// Writes the schema as C++ constants: quorl-schema-text <folder of protobuf's own files> <schema folder> <output>
// <file>...

#include <algorithm>
#include <fstream>
#include <iostream>
#include <iterator>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <google/protobuf/compiler/importer.h>
#include <google/protobuf/descriptor.h>

namespace {

namespace pb = google::protobuf;

struct Definition {
  std::string name;
  std::string text;
  std::vector<std::size_t> uses;
};

struct File {
  std::string comment;
  std::size_t first = 0;
  std::size_t count = 0;
};

class ErrorPrinter final : public pb::compiler::MultiFileErrorCollector {
 public:
  void AddError(const std::string& file, int line, int column, const std::string& message) override {
    std::cerr << fmt::format("{}:{}:{}: {}\n", file, line + 1, column + 1, message);
  }
};

std::vector<std::string> linesOf(const std::string& path) {
  std::ifstream input(path);
  std::vector<std::string> lines;
  for (std::string line; std::getline(input, line);) lines.push_back(line);
  return lines;
}

bool isComment(const std::string& line) {
  return line.starts_with("//");
}

/// The line without our own options; nothing is left of a line that held nothing else.
std::string withoutOwnOptions(std::string line) {
  constexpr std::string_view kOwnOption = "(quorl.schema.";
  const std::size_t begin = line.find(kOwnOption);
  if (begin == std::string::npos) return line;
  if (line.find("option " + std::string(kOwnOption)) != std::string::npos) return {};
  // Of a field's options ours is a text, and the last one.
  line.erase(begin, line.find(']', begin) - begin);
  constexpr std::string_view kNothingElse = " []";
  constexpr std::string_view kComma = ", ";
  if (const std::size_t empty = line.find(kNothingElse); empty != std::string::npos) {
    line.erase(empty, kNothingElse.size());
  } else {
    line.erase(begin - kComma.size(), kComma.size());
  }
  // The comment behind it stood in a column with those of other lines.
  const std::size_t comment = line.find("//");
  if (comment != std::string::npos) line.replace(line.find(';') + 1, comment - line.find(';') - 1, "  ");
  return line;
}

/// A definition as its file has it, from its comment to its closing brace.
template <typename Descriptor>
std::string definitionText(const Descriptor& descriptor, const std::vector<std::string>& lines) {
  pb::SourceLocation location;
  descriptor.GetSourceLocation(&location);
  auto begin = static_cast<std::size_t>(location.start_line);
  while (begin > 0 && isComment(lines[begin - 1])) --begin;
  std::string text;
  bool skipsBlank = false;
  for (auto at = begin; at <= static_cast<std::size_t>(location.end_line); ++at) {
    const std::string plain = withoutOwnOptions(lines[at]);
    const bool isDropped = plain.empty() && (skipsBlank || !lines[at].empty());
    skipsBlank = isDropped;
    if (!isDropped) text += plain + "\n";
  }
  return text;
}

std::string headComment(const std::vector<std::string>& lines) {
  std::string text;
  for (auto line = lines.begin(); line != lines.end() && isComment(*line); ++line) text += *line + "\n";
  return text;
}

const pb::Descriptor* outermost(const pb::Descriptor* message) {
  while (message->containing_type() != nullptr) message = message->containing_type();
  return message;
}

/// Names of the top-level definitions that the fields of a message refer to.
void collectUses(const pb::Descriptor& message, std::vector<std::string>& names) {
  for (int i = 0; i < message.field_count(); ++i) {
    const pb::FieldDescriptor* field = message.field(i);
    if (field->message_type() != nullptr) names.push_back(outermost(field->message_type())->name());
    if (const pb::EnumDescriptor* type = field->enum_type())
      names.push_back(type->containing_type() != nullptr ? outermost(type->containing_type())->name() : type->name());
  }
  for (int i = 0; i < message.nested_type_count(); ++i) collectUses(*message.nested_type(i), names);
}

class Schema {
 public:
  void add(const pb::FileDescriptor& descriptor, const std::string& path) {
    const std::vector<std::string> lines = linesOf(path);
    std::map<int, Definition> byLine;
    std::map<int, const pb::Descriptor*> messageByLine;
    pb::SourceLocation location;
    for (int i = 0; i < descriptor.message_type_count(); ++i) {
      const pb::Descriptor& message = *descriptor.message_type(i);
      message.GetSourceLocation(&location);
      byLine[location.start_line] = {message.name(), definitionText(message, lines), {}};
      messageByLine[location.start_line] = &message;
    }
    for (int i = 0; i < descriptor.enum_type_count(); ++i) {
      const pb::EnumDescriptor& enumeration = *descriptor.enum_type(i);
      enumeration.GetSourceLocation(&location);
      byLine[location.start_line] = {enumeration.name(), definitionText(enumeration, lines), {}};
    }
    if (byLine.empty()) return;
    files_.push_back({headComment(lines), definitions_.size(), byLine.size()});
    for (auto& [line, definition] : byLine) {
      indexByName_[definition.name] = definitions_.size();
      if (messageByLine.contains(line)) messages_[definitions_.size()] = messageByLine[line];
      definitions_.push_back(std::move(definition));
    }
  }

  void resolve() {
    for (const auto& [index, message] : messages_) {
      std::vector<std::string> names;
      collectUses(*message, names);
      for (const std::string& name : names) {
        const std::size_t used = indexByName_.at(name);
        auto& uses = definitions_[index].uses;
        if (used != index && std::find(uses.begin(), uses.end(), used) == uses.end()) uses.push_back(used);
      }
    }
  }

  std::string source() const {
    std::string text =
        "// Generated from the schema; do not edit.\n"
        "#include \"schema/SchemaText.h\"\n\nnamespace quorl::tool {\nnamespace {\n\n";
    for (std::size_t i = 0; i < definitions_.size(); ++i)
      if (!definitions_[i].uses.empty())
        text += fmt::format("constexpr unsigned short kUses{}[] = {{{}}};\n", i, fmt::join(definitions_[i].uses, ", "));
    text += "\nconstexpr SchemaDefinition kDefinitions[] = {\n";
    for (std::size_t i = 0; i < definitions_.size(); ++i)
      text += fmt::format("{{\"{}\", R\"proto({})proto\", {}}},\n", definitions_[i].name, definitions_[i].text,
                          definitions_[i].uses.empty() ? "{}" : fmt::format("kUses{}", i));
    text += "};\n\nconstexpr SchemaFile kFiles[] = {\n";
    for (const File& file : files_)
      text += fmt::format("{{R\"proto({})proto\", {}, {}}},\n", file.comment, file.first, file.count);
    text +=
        "};\n\n}  // namespace\n\n"
        "std::span<const SchemaDefinition> schemaDefinitions() {\n  return kDefinitions;\n}\n\n"
        "std::span<const SchemaFile> schemaFiles() {\n  return kFiles;\n}\n\n"
        "std::string_view schemaHead() {\n  return \"syntax = \\\"proto2\\\";\\n\\npackage quorl.schema;\\n\";\n}\n\n"
        "}  // namespace quorl::tool\n";
    return text;
  }

 private:
  std::vector<Definition> definitions_;
  std::vector<File> files_;
  std::map<std::string, std::size_t> indexByName_;
  std::map<std::size_t, const pb::Descriptor*> messages_;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc < 5) {
    std::cerr << "usage: quorl-schema-text <folder of protobuf's own files> <schema folder> <output> <file>...\n";
    return 2;
  }
  const std::string folder = argv[2];
  pb::compiler::DiskSourceTree tree;
  tree.MapPath("", folder);
  tree.MapPath("", argv[1]);
  ErrorPrinter errors;
  pb::compiler::Importer importer(&tree, &errors);
  Schema schema;
  for (int i = 4; i < argc; ++i) {
    const pb::FileDescriptor* file = importer.Import(argv[i]);
    if (file == nullptr) return 1;
    schema.add(*file, folder + "/" + argv[i]);
  }
  schema.resolve();
  std::ofstream output(argv[3]);
  output << schema.source();
  return output.flush() ? 0 : 1;
}
