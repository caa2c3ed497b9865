#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include <google/protobuf/descriptor.h>

#include "messages/generator/Names.h"

namespace quorl::generator {

/// What the two emitters need to know of one field.
struct Field {
  const google::protobuf::FieldDescriptor* descriptor;
  MemberNames names;
  std::string member;      // stored member, with trailing underscore
  std::string kind;        // enumerator of FieldKind
  std::string storedType;  // type of the stored member
  std::string scalarType;  // of scalars, enumerations and elements of lists; empty for others
  std::string childClass;  // of message fields; empty for others
  std::size_t alignment;
  int flagIndex = -1;  // of scalars that are not repeated

  bool isRepeated() const { return descriptor->is_repeated(); }
  bool isScalar() const { return flagIndex >= 0; }
  bool isEnumeration() const { return descriptor->enum_type() != nullptr; }
  /// Whether the getter tests the flag and answers `defaultValue` for an absent field.
  bool hasDefault() const { return isEnumeration() || descriptor->has_default_value(); }
  int defaultValue() const;
};

struct Message {
  const google::protobuf::Descriptor* descriptor;
  std::vector<Field> fields;  // in the order of the table
  std::size_t flagCount = 0;

  std::size_t flagWords() const { return (flagCount + 31) / 32; }

  const std::string& name() const { return descriptor->name(); }
};

/// Throws std::runtime_error for what the message classes do not offer: other field types, repeated enumerations,
/// repeated texts and byte strings, messages that contain themselves, and names that C++ or the base class has taken.
std::vector<Message> messagesOf(const google::protobuf::FileDescriptor& file);

}  // namespace quorl::generator
