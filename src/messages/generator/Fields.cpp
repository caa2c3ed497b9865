#include "messages/generator/Fields.h"

#include <algorithm>
#include <iterator>
#include <set>
#include <stdexcept>
#include <string_view>

namespace quorl::generator {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;

namespace {

// The base class's own names, and the C++ keywords that a camel-cased key could be.
constexpr std::string_view kTakenNames[] = {
    "table",     "initWithData", "isReadWhole", "readFrom", "writeTo",      "dictionaryRepresentation",
    "hash",      "description",  "copyTo",      "isEqual",  "copyWithZone", "mergeFrom",
    "alignas",   "alignof",      "and",         "asm",      "auto",         "bitand",
    "bitor",     "bool",         "break",       "case",     "catch",        "char",
    "class",     "compl",        "concept",     "const",    "consteval",    "constexpr",
    "constinit", "continue",     "decltype",    "default",  "delete",       "do",
    "double",    "else",         "enum",        "explicit", "export",       "extern",
    "false",     "float",        "for",         "friend",   "goto",         "if",
    "inline",    "int",          "long",        "mutable",  "namespace",    "new",
    "noexcept",  "not",          "nullptr",     "operator", "or",           "private",
    "protected", "public",       "register",    "requires", "return",       "short",
    "signed",    "sizeof",       "static",      "struct",   "switch",       "template",
    "this",      "throw",        "true",        "try",      "typedef",      "typeid",
    "typename",  "union",        "unsigned",    "using",    "virtual",      "void",
    "volatile",  "while",        "xor"};

[[noreturn]] void fail(const FieldDescriptor& field, const std::string& why) {
  throw std::runtime_error(field.full_name() + ": " + why);
}

struct ScalarType {
  const char* kind;
  const char* type;
  const char* list;
  std::size_t alignment;
};

ScalarType scalarType(const FieldDescriptor& field) {
  switch (field.type()) {
    case FieldDescriptor::TYPE_UINT32:
      return {"UInt32", "std::uint32_t", "UInt32List", 4};
    case FieldDescriptor::TYPE_UINT64:
      return {"UInt64", "std::uint64_t", "UInt64List", 8};
    case FieldDescriptor::TYPE_SINT32:
      return {"SInt32", "std::int32_t", "SInt32List", 4};
    case FieldDescriptor::TYPE_INT32:
      if (field.is_repeated()) fail(field, "a repeated int32 is not offered");
      return {"Int32", "std::int32_t", nullptr, 4};
    case FieldDescriptor::TYPE_BOOL:
      if (field.is_repeated()) fail(field, "a repeated bool is not offered");
      return {"Bool", "bool", nullptr, 1};
    case FieldDescriptor::TYPE_ENUM:
      if (field.is_repeated()) fail(field, "a repeated enumeration is not offered");
      return {"Enumeration", "std::int32_t", nullptr, 4};
    default:
      fail(field, "this type is not offered");
  }
}

Field makeField(const FieldDescriptor& descriptor) {
  Field field{};
  field.descriptor = &descriptor;
  field.names = memberNames(descriptor);
  field.member = memberName(descriptor) + "_";
  field.alignment = 8;
  field.flagIndex = -1;
  if (std::find(std::begin(kTakenNames), std::end(kTakenNames), memberName(descriptor)) != std::end(kTakenNames))
    fail(descriptor, "the member name is taken; give it another with the option `member`");
  switch (descriptor.type()) {
    case FieldDescriptor::TYPE_MESSAGE:
      field.childClass = descriptor.message_type()->name();
      field.kind = field.isRepeated() ? "RepeatedMessage" : "Message";
      field.storedType = (field.isRepeated() ? "MessageArray<" : "MessageRef<") + field.childClass + ">";
      break;
    case FieldDescriptor::TYPE_BYTES:
    case FieldDescriptor::TYPE_STRING: {
      if (field.isRepeated()) fail(descriptor, "repeated texts and byte strings are not offered");
      const bool isText = descriptor.type() == FieldDescriptor::TYPE_STRING;
      field.kind = isText ? "String" : "Bytes";
      field.storedType = isText ? "std::optional<Text>" : "std::optional<ByteString>";
      break;
    }
    default: {
      const ScalarType scalar = scalarType(descriptor);
      field.scalarType = scalar.type;
      field.kind = (field.isRepeated() ? "Repeated" : "") + std::string(scalar.kind);
      field.storedType = field.isRepeated() ? scalar.list : scalar.type;
      if (!field.isRepeated()) field.alignment = scalar.alignment;
    }
  }
  return field;
}

void checkIsNotInItself(const Descriptor& message, std::set<const Descriptor*>& around) {
  if (!around.insert(&message).second) throw std::runtime_error(message.full_name() + ": contains itself");
  for (int i = 0; i < message.field_count(); ++i)
    if (const Descriptor* child = message.field(i)->message_type()) checkIsNotInItself(*child, around);
  around.erase(&message);
}

}  // namespace

int Field::defaultValue() const {
  return isEnumeration() ? descriptor->default_value_enum()->number() : descriptor->default_value_int32();
}

std::vector<Message> messagesOf(const google::protobuf::FileDescriptor& file) {
  std::vector<Message> messages;
  for (int i = 0; i < file.message_type_count(); ++i) {
    Message message;
    message.descriptor = file.message_type(i);
    std::set<const Descriptor*> around;
    checkIsNotInItself(*message.descriptor, around);
    int flags = 0;
    for (int k = 0; k < message.descriptor->field_count(); ++k) {
      Field field = makeField(*message.descriptor->field(k));
      if (!field.scalarType.empty() && !field.isRepeated()) field.flagIndex = flags++;
      message.fields.push_back(std::move(field));
    }
    message.flagCount = static_cast<std::size_t>(flags);
    messages.push_back(std::move(message));
  }
  return messages;
}

}  // namespace quorl::generator
