#include "messages/generator/SourceEmitter.h"

#include <algorithm>
#include <set>
#include <stdexcept>

#include <fmt/format.h>

#include "messages/generator/Fields.h"
#include "messages/generator/HeaderEmitter.h"
#include "messages/generator/Output.h"
#include "quorl_options.pb.h"

namespace quorl::generator {

using google::protobuf::EnumDescriptor;
using google::protobuf::EnumValueDescriptor;
using google::protobuf::FileDescriptor;

namespace {

void emitEnumTable(Output& out, const EnumDescriptor& enumeration) {
  const std::string name = enumTableName(enumeration);
  const std::string entries = "k" + name.substr(name.rfind(':') + 1) + "Entries";
  std::vector<const EnumValueDescriptor*> values;
  for (int i = 0; i < enumeration.value_count(); ++i) values.push_back(enumeration.value(i));
  std::sort(values.begin(), values.end(), [](const auto* a, const auto* b) { return a->number() < b->number(); });
  emit(out, "namespace {{\nconstexpr EnumTable::Entry {}[] = {{\n", entries);
  for (const EnumValueDescriptor* value : values) emit(out, "    {{{}, \"{}\"}},\n", value->number(), value->name());
  // Without an own default, that of an enumeration is its first enumerator.
  emit(out, "}};\n}}  // namespace\nconstinit const EnumTable {}{{{}, {}}};\n\n", name, entries,
       enumeration.value(0)->number());
}

void emitFieldEntry(Output& out, const Field& field) {
  const unsigned flag = field.isScalar() ? 1U << (field.flagIndex % 32) : 0;
  const std::string flagOffset = field.isScalar() ? fmt::format("offsetof(Self, has_[{}])", field.flagIndex / 32) : "0";
  emit(out, "      {{{}, {:#x}U, {}, offsetof(Self, {}), FieldKind::{}, {}, \"{}\", {}, {}}},\n",
       field.descriptor->number(), flag, flagOffset, field.member, field.kind,
       field.isRepeated() && field.descriptor->is_packed(), field.descriptor->name(),
       field.childClass.empty() ? "nullptr" : "&" + field.childClass + "::kTable",
       field.isEnumeration() ? "&" + enumTableName(*field.descriptor->enum_type()) : "nullptr");
}

void emitIndexByTag(Output& out, const Message& message) {
  constexpr std::size_t kMaxTag = 4095;
  constexpr std::size_t kMaxFields = 255;
  std::vector<std::size_t> indices(1, 0);
  for (std::size_t i = 0; i < message.fields.size(); ++i) {
    const auto tag = static_cast<std::size_t>(message.fields[i].descriptor->number());
    if (tag > kMaxTag || i >= kMaxFields) throw std::runtime_error(message.name() + ": too large for its table");
    if (tag >= indices.size()) indices.resize(tag + 1);
    indices[tag] = i + 1;
  }
  emit(out, "  static constexpr std::uint8_t kIndexByTag[] = {{{}}};\n", fmt::join(indices, ", "));
}

void emitMessage(Output& out, const Message& message) {
  const std::string& name = message.name();
  emit(out, "struct {}::Fields {{\n  using Self = {};\n  static constexpr FieldEntry kEntries[] = {{\n", name, name);
  for (const Field& field : message.fields) emitFieldEntry(out, field);
  emit(out, "  }};\n");
  emitIndexByTag(out, message);
  if (message.flagCount > 0) emit(out, "  static constexpr std::uint16_t kFlagOffset = offsetof(Self, has_);\n");
  emit(out, "}};\n\n");
  emit(out, "constinit const MessageTable {}::kTable{{\"{}\", Fields::kEntries, {}, {}, Fields::kIndexByTag, {},\n",
       name, name, message.flagCount > 0 ? "Fields::kFlagOffset" : "0", message.flagCount,
       message.descriptor->options().GetExtension(schema::accepts_metric_id_tags));
  emit(out, "    []() -> MetricCodable* {{ return new {}; }}}};\n\n", name);
  emit(out, "{}::{}() = default;\n{}::~{}() = default;\n", name, name, name, name);
  emit(out, "const MessageTable& {}::table() const {{ return kTable; }}\n", name);
  for (const Field& field : message.fields) {
    const std::string& singular = field.names.singular;
    if (field.isEnumeration()) {
      const std::string table = enumTableName(*field.descriptor->enum_type());
      emit(out, "Text {}::{}AsString(std::int32_t value) const {{ return {}.name(value); }}\n", name, singular, table);
      emit(out, "std::int32_t {}::StringAs{}(std::string_view name) const {{ return {}.value(name); }}\n", name,
           capitalised(singular), table);
    } else if (field.isRepeated() && !field.childClass.empty()) {
      emit(out, "const MessageTable& {}::{}Type() {{ return {}::kTable; }}\n", name, singular, field.childClass);
    }
  }
  emit(out, "\n");
}

}  // namespace

std::string emitSource(const FileDescriptor& file) {
  const std::vector<Message> messages = messagesOf(file);
  std::set<std::string> headers;
  for (const Message& message : messages)
    for (const Field& field : message.fields)
      if (!field.childClass.empty() && field.descriptor->message_type()->file() != &file)
        headers.insert(baseName(*field.descriptor->message_type()->file()));
  Output out;
  emit(out, "{}#include \"messages/classes/{}.h\"\n\n", banner(file.name()), baseName(file));
  emit(out, "#include \"messages/MessageTable.h\"\n");
  for (const std::string& header : headers) emit(out, "#include \"messages/classes/{}.h\"\n", header);
  if (!messages.empty())
    emit(out,
         "\n// The message classes have a virtual table; both compilers support their offsets all the same.\n"
         "#pragma GCC diagnostic ignored \"-Winvalid-offsetof\"\n");
  emit(out, "\nnamespace quorl {{\n\n");
  for (int i = 0; i < file.enum_type_count(); ++i) emitEnumTable(out, *file.enum_type(i));
  for (const Message& message : messages)
    for (int i = 0; i < message.descriptor->enum_type_count(); ++i)
      emitEnumTable(out, *message.descriptor->enum_type(i));
  for (const Message& message : messages) emitMessage(out, message);
  emit(out, "}}  // namespace quorl\n");
  return fmt::to_string(out);
}

std::string emitRegistry(const std::vector<const FileDescriptor*>& files) {
  std::set<std::string> classes;
  Output out;
  emit(out, "{}", banner("all schema files"));
  emit(out, "#include \"messages/MessageTable.h\"\n");
  for (const FileDescriptor* file : files) {
    if (file->message_type_count() > 0) emit(out, "#include \"messages/classes/{}.h\"\n", baseName(*file));
    for (int i = 0; i < file->message_type_count(); ++i) classes.insert(file->message_type(i)->name());
  }
  emit(out, "\nnamespace quorl {{\n\nnamespace {{\nconstexpr const MessageTable* kTables[] = {{\n");
  for (const std::string& name : classes) emit(out, "    &{}::kTable,\n", name);
  emit(out, "}};\n}}  // namespace\n\nstd::span<const MessageTable* const> allMessageTables() {{ return kTables; }}\n");
  emit(out, "\n}}  // namespace quorl\n");
  return fmt::to_string(out);
}

}  // namespace quorl::generator
