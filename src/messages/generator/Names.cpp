#include "messages/generator/Names.h"

#include "quorl_options.pb.h"

namespace quorl::generator {

namespace {

char upper(char c) {
  return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
}

char lower(char c) {
  return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

}  // namespace

std::string camelCase(std::string_view key) {
  std::string name;
  bool isBehindUnderscore = false;
  for (const char c : key) {
    if (c == '_') {
      isBehindUnderscore = true;
      continue;
    }
    name += isBehindUnderscore ? upper(c) : c;
    isBehindUnderscore = false;
  }
  if (!name.empty()) name[0] = lower(name[0]);
  return name;
}

std::string capitalised(std::string text) {
  if (!text.empty()) text[0] = upper(text[0]);
  return text;
}

MemberNames memberNames(const google::protobuf::FieldDescriptor& field) {
  MemberNames names;
  const auto& options = field.options();
  names.singular =
      options.HasExtension(schema::member) ? options.GetExtension(schema::member) : camelCase(field.name());
  if (field.is_repeated())
    names.plural = options.HasExtension(schema::plural) ? options.GetExtension(schema::plural) : names.singular + "s";
  return names;
}

std::string memberName(const google::protobuf::FieldDescriptor& field) {
  const MemberNames names = memberNames(field);
  return field.is_repeated() ? names.plural : names.singular;
}

std::string enumName(const google::protobuf::EnumDescriptor& enumeration) {
  const auto& options = enumeration.options();
  return options.HasExtension(schema::enumeration) ? options.GetExtension(schema::enumeration) : enumeration.name();
}

std::string enumTableName(const google::protobuf::EnumDescriptor& enumeration) {
  const std::string name = enumName(enumeration);
  const auto* owner = enumeration.containing_type();
  return "enum_table::" + (owner == nullptr ? name : owner->name() + "_" + name);
}

std::string baseName(const google::protobuf::FileDescriptor& file) {
  const std::string& name = file.name();
  return name.substr(0, name.rfind('.'));
}

}  // namespace quorl::generator
