#pragma once

#include <string>
#include <string_view>

#include <google/protobuf/descriptor.h>

namespace quorl::generator {

/// The key without each '_', the character behind it in upper case and the first character of the whole in lower case.
std::string camelCase(std::string_view key);
/// The text with its first character in upper case.
std::string capitalised(std::string text);

/// How the accessors of a field are called.
struct MemberNames {
  std::string singular;  // of a field that is not repeated: the member
  std::string plural;    // of a repeated field: the member
};

MemberNames memberNames(const google::protobuf::FieldDescriptor& field);
/// Member name of a field: the plural of a repeated one.
std::string memberName(const google::protobuf::FieldDescriptor& field);

/// Name of the C++ enumeration.
std::string enumName(const google::protobuf::EnumDescriptor& enumeration);
/// The C++ expression that names the table of an enumeration, from within namespace quorl.
std::string enumTableName(const google::protobuf::EnumDescriptor& enumeration);

/// "nas_context" for "nas_context.proto".
std::string baseName(const google::protobuf::FileDescriptor& file);

}  // namespace quorl::generator
