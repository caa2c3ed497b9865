#include "messages/generator/HeaderEmitter.h"

#include <algorithm>
#include <set>
#include <sstream>
#include <vector>

#include <fmt/format.h>

#include "messages/generator/Fields.h"
#include "messages/generator/Output.h"

namespace quorl::generator {

using google::protobuf::EnumDescriptor;
using google::protobuf::FileDescriptor;

namespace {

/// The schema's comment, line by line.
void emitComment(Output& out, std::string_view indent, std::string_view mark, const std::string& text) {
  std::istringstream lines(text);
  for (std::string line; std::getline(lines, line);) emit(out, "{}{}{}\n", indent, mark, line);
}

template <typename Descriptor>
google::protobuf::SourceLocation location(const Descriptor& descriptor) {
  google::protobuf::SourceLocation result;
  descriptor.GetSourceLocation(&result);
  return result;
}

void emitEnum(Output& out, std::string_view indent, const EnumDescriptor& enumeration) {
  emitComment(out, indent, "///", location(enumeration).leading_comments);
  emit(out, "{}enum {} : std::int32_t {{\n", indent, enumName(enumeration));
  for (int i = 0; i < enumeration.value_count(); ++i)
    emit(out, "{}  {} = {},\n", indent, enumeration.value(i)->name(), enumeration.value(i)->number());
  emit(out, "{}}};\n\n", indent);
}

std::string flagTest(const Field& field) {
  return fmt::format("(has_[{}] & {:#x}U) != 0", field.flagIndex / 32, 1U << (field.flagIndex % 32));
}

void emitScalar(Output& out, const Field& field) {
  const std::string& name = field.names.singular;
  const std::string upperName = capitalised(name);
  const std::string has = "has" + upperName;
  const std::string flagWord = fmt::format("has_[{}]", field.flagIndex / 32);
  const std::string flag = fmt::format("{:#x}U", 1U << (field.flagIndex % 32));
  const std::string value =
      field.hasDefault() ? fmt::format("{}() ? {} : {}", has, field.member, field.defaultValue()) : field.member;
  emit(out, "  {} {}() const {{ return {}; }}\n", field.scalarType, name, value);
  emit(out, "  void set{}({} value) {{\n    {} = value;\n    {} |= {};\n  }}\n", upperName, field.scalarType,
       field.member, flagWord, flag);
  emit(out, "  bool {}() const {{ return {}; }}\n", has, flagTest(field));
  emit(out, "  void setHas{}(bool has) {{ {} = has ? {} | {} : {} & ~{}; }}\n", upperName, flagWord, flagWord, flag,
       flagWord, flag);
  if (!field.isEnumeration()) return;
  emit(out, "  Text {}AsString(std::int32_t value) const;\n", name);
  emit(out, "  std::int32_t StringAs{}(std::string_view name) const;\n", upperName);
}

void emitReference(Output& out, const Field& field) {
  const std::string& name = field.names.singular;
  const std::string upperName = capitalised(name);
  emit(out, "  const {}& {}() const {{ return {}; }}\n", field.storedType, name, field.member);
  emit(out, "  void set{}({} value) {{ {} = std::move(value); }}\n", upperName, field.storedType, field.member);
  emit(out, "  bool has{}() const {{ return static_cast<bool>({}); }}\n", upperName, field.member);
}

void emitArray(Output& out, const Field& field) {
  const std::string& name = field.names.singular;
  const std::string& plural = field.names.plural;
  const std::string upperName = capitalised(name);
  const std::string upperPlural = capitalised(plural);
  emit(out, "  const {}& {}() const {{ return {}; }}\n", field.storedType, plural, field.member);
  emit(out, "  void set{}({} array) {{ {} = std::move(array); }}\n", upperPlural, field.storedType, field.member);
  emit(out, "  void clear{}() {{ {}.clear(); }}\n", upperPlural, field.member);
  emit(out, "  void add{}(MessageRef<{}> element) {{ {}.add(std::move(element)); }}\n", upperName, field.childClass,
       field.member);
  emit(out, "  std::size_t {}Count() const {{ return {}.count(); }}\n", plural, field.member);
  emit(out, "  MessageRef<{}> {}AtIndex(std::size_t index) const {{ return {}.atIndex(index); }}\n", field.childClass,
       name, field.member);
  emit(out, "  static const MessageTable& {}Type();\n", name);
}

void emitList(Output& out, const Field& field) {
  const std::string& name = field.names.singular;
  const std::string& plural = field.names.plural;
  const std::string upperName = capitalised(name);
  const std::string upperPlural = capitalised(plural);
  const std::string& type = field.scalarType;
  emit(out, "  const {}* {}() const {{ return {}.list; }}\n", type, plural, field.member);
  emit(out, "  std::size_t {}Count() const {{ return {}.count; }}\n", plural, field.member);
  emit(out, "  void clear{}() {{ {}.clear(); }}\n", upperPlural, field.member);
  emit(out, "  void add{}({} value) {{ {}.add(value); }}\n", upperName, type, field.member);
  emit(out, "  void set{}(const {}* values, std::size_t count) {{ {}.set(values, count); }}\n", upperPlural, type,
       field.member);
  emit(out, "  {} {}AtIndex(std::size_t index) const {{ return elementAtIndex({}, index); }}\n", type, name,
       field.member);
}

void emitMembers(Output& out, const Message& message) {
  // Widest first, so that no room is lost between them.
  std::vector<const Field*> fields;
  for (const Field& field : message.fields) fields.push_back(&field);
  std::stable_sort(fields.begin(), fields.end(),
                   [](const Field* a, const Field* b) { return a->alignment > b->alignment; });
  const auto emitMember = [&](const Field& field) {
    emit(out, "  {} {}{};\n", field.storedType, field.member,
         !field.isScalar()            ? ""
         : field.storedType == "bool" ? " = false"
                                      : " = 0");
  };
  auto field = fields.begin();
  for (; field != fields.end() && (*field)->alignment == 8; ++field) emitMember(**field);
  if (message.flagCount > 0) emit(out, "  std::uint32_t has_[{}] = {{}};\n", message.flagWords());
  for (; field != fields.end(); ++field) emitMember(**field);
}

void emitClass(Output& out, const Message& message) {
  const std::string& name = message.name();
  emitComment(out, "", "///", location(*message.descriptor).leading_comments);
  emit(out, "class {} final : public MetricCodable {{\n public:\n", name);
  for (int i = 0; i < message.descriptor->enum_type_count(); ++i)
    emitEnum(out, "  ", *message.descriptor->enum_type(i));
  emit(out, "  static const MessageTable kTable;\n\n  {}();\n  ~{}() override;\n", name, name);
  emit(out, "  const MessageTable& table() const override;\n");
  for (const Field& field : message.fields) {
    emit(out, "\n");
    emitComment(out, "  ", "///", location(*field.descriptor).trailing_comments);
    if (field.isScalar())
      emitScalar(out, field);
    else if (!field.isRepeated())
      emitReference(out, field);
    else if (!field.childClass.empty())
      emitArray(out, field);
    else
      emitList(out, field);
  }
  emit(out, "\n private:\n  struct Fields;\n\n");
  emitMembers(out, message);
  emit(out, "}};\n\n");
}

std::set<std::string> forwardDeclarations(const std::vector<Message>& messages) {
  std::set<std::string> names;
  for (const Message& message : messages)
    for (const Field& field : message.fields)
      if (!field.childClass.empty()) names.insert(field.childClass);
  return names;
}

/// Headers of the files whose top-level enumerations this file uses.
std::set<std::string> enumerationHeaders(const FileDescriptor& file, const std::vector<Message>& messages) {
  std::set<std::string> names;
  for (const Message& message : messages)
    for (const Field& field : message.fields)
      if (field.isEnumeration() && field.descriptor->enum_type()->file() != &file)
        names.insert(baseName(*field.descriptor->enum_type()->file()));
  return names;
}

}  // namespace

std::string banner(const std::string& madeFrom) {
  return "// Made by the message generator from " + madeFrom + ". Do not edit.\n";
}

std::string emitHeader(const FileDescriptor& file) {
  const std::vector<Message> messages = messagesOf(file);
  Output out;
  emit(out, "{}#pragma once\n\n#include <cstddef>\n#include <cstdint>\n", banner(file.name()));
  if (!messages.empty()) {
    emit(out, "#include <optional>\n#include <string_view>\n#include <utility>\n\n");
    emit(out, "#include \"base/SharedBytes.h\"\n#include \"messages/MessageRef.h\"\n");
    emit(out, "#include \"messages/MetricCodable.h\"\n");
    for (const std::string& name : enumerationHeaders(file, messages))
      emit(out, "#include \"messages/classes/{}.h\"\n", name);
    emit(out, "#include \"messages/wire/ListRecord.h\"\n");
  }
  emit(out, "\nnamespace quorl {{\n\nstruct EnumTable;\nstruct MessageTable;\n");
  for (const std::string& name : forwardDeclarations(messages)) emit(out, "class {};\n", name);
  emit(out, "\n");
  for (int i = 0; i < file.enum_type_count(); ++i) emitEnum(out, "", *file.enum_type(i));
  emit(out, "namespace enum_table {{\n");
  for (int i = 0; i < file.enum_type_count(); ++i)
    emit(out, "extern const EnumTable {};\n", enumName(*file.enum_type(i)));
  for (const Message& message : messages)
    for (int i = 0; i < message.descriptor->enum_type_count(); ++i)
      emit(out, "extern const EnumTable {}_{};\n", message.name(), enumName(*message.descriptor->enum_type(i)));
  emit(out, "}}  // namespace enum_table\n\n");
  for (const Message& message : messages) emitClass(out, message);
  emit(out, "}}  // namespace quorl\n");
  return fmt::to_string(out);
}

}  // namespace quorl::generator
