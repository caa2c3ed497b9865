#include "messages/ProtobufSide.h"

#include <set>
#include <stdexcept>

#include <google/protobuf/descriptor.pb.h>

#include "messages/MessageTable.h"

namespace quorl::test {

using google::protobuf::Descriptor;
using google::protobuf::DescriptorPool;
using google::protobuf::FieldDescriptor;
using google::protobuf::FieldDescriptorProto;
using google::protobuf::FileDescriptor;
using google::protobuf::FileDescriptorProto;
using google::protobuf::Message;
using google::protobuf::Reflection;

namespace {

NumberList numbersOf(const Message& message, const FieldDescriptor& field) {
  const Reflection& reflection = *message.GetReflection();
  NumberList list;
  list.isSigned = field.cpp_type() == FieldDescriptor::CPPTYPE_INT32;
  for (int i = 0; i < reflection.FieldSize(message, &field); ++i) {
    if (field.cpp_type() == FieldDescriptor::CPPTYPE_UINT32)
      list.bits.push_back(reflection.GetRepeatedUInt32(message, &field, i));
    else if (field.cpp_type() == FieldDescriptor::CPPTYPE_UINT64)
      list.bits.push_back(reflection.GetRepeatedUInt64(message, &field, i));
    else
      list.bits.push_back(static_cast<std::uint64_t>(reflection.GetRepeatedInt32(message, &field, i)));
  }
  return list;
}

Text enumeratorName(const google::protobuf::EnumDescriptor& enumeration, int value) {
  const auto* enumerator = enumeration.FindValueByNumber(value);
  return Text(enumerator == nullptr ? "(unknown: " + std::to_string(value) + ")" : enumerator->name());
}

MetricValue valueOf(const Message& message, const FieldDescriptor& field, const FieldDescriptor& named) {
  const Reflection& reflection = *message.GetReflection();
  switch (field.cpp_type()) {
    case FieldDescriptor::CPPTYPE_UINT32:
      return std::uint64_t{reflection.GetUInt32(message, &field)};
    case FieldDescriptor::CPPTYPE_UINT64:
      return std::uint64_t{reflection.GetUInt64(message, &field)};
    case FieldDescriptor::CPPTYPE_INT32: {
      const std::int32_t value = reflection.GetInt32(message, &field);
      if (const auto* enumeration = named.enum_type()) return enumeratorName(*enumeration, value);
      return std::int64_t{value};
    }
    case FieldDescriptor::CPPTYPE_BOOL:
      return reflection.GetBool(message, &field);
    case FieldDescriptor::CPPTYPE_ENUM:
      return Text(reflection.GetEnum(message, &field)->name());
    case FieldDescriptor::CPPTYPE_STRING:
      if (field.type() == FieldDescriptor::TYPE_BYTES) return ByteString(reflection.GetString(message, &field));
      return Text(reflection.GetString(message, &field));
    case FieldDescriptor::CPPTYPE_MESSAGE:
      return expectedDictionary(reflection.GetMessage(message, &field), *named.message_type());
    default:
      throw std::logic_error(field.full_name() + ": no such kind in the schema");
  }
}

void turnField(FieldDescriptorProto& field) {
  if (field.type() == FieldDescriptorProto::TYPE_ENUM) {
    field.set_type(FieldDescriptorProto::TYPE_INT32);
    field.clear_type_name();
    field.clear_default_value();
  }
  const bool isRepeated = field.label() == FieldDescriptorProto::LABEL_REPEATED;
  const bool isMessage = field.type() == FieldDescriptorProto::TYPE_MESSAGE;
  const bool wasPacked = field.options().packed();
  field.clear_options();
  if (isRepeated && !isMessage) field.mutable_options()->set_packed(!wasPacked);
}

void addTurned(const FileDescriptor& file, DescriptorPool& pool, std::set<std::string>& added) {
  if (!added.insert(file.name()).second) return;
  for (int i = 0; i < file.dependency_count(); ++i) addTurned(*file.dependency(i), pool, added);
  FileDescriptorProto proto;
  file.CopyTo(&proto);
  if (file.package() == "quorl.schema") {
    for (auto& message : *proto.mutable_message_type())
      for (auto& field : *message.mutable_field()) turnField(field);
  }
  if (pool.BuildFile(proto) == nullptr) throw std::logic_error(file.name() + ": cannot be turned");
}

}  // namespace

MetricDictionary expectedDictionary(const Message& message, const Descriptor& named) {
  MetricDictionary dictionary;
  const Reflection& reflection = *message.GetReflection();
  const Descriptor& descriptor = *message.GetDescriptor();
  for (int i = 0; i < descriptor.field_count(); ++i) {
    const FieldDescriptor& field = *descriptor.field(i);
    if (!field.is_repeated()) {
      if (reflection.HasField(message, &field)) dictionary.set(field.name(), valueOf(message, field, *named.field(i)));
    } else if (field.cpp_type() != FieldDescriptor::CPPTYPE_MESSAGE) {
      dictionary.set(field.name(), numbersOf(message, field));
    } else if (const int count = reflection.FieldSize(message, &field); count > 0) {
      MetricDictionaryList list;
      for (int k = 0; k < count; ++k)
        list.push_back(
            expectedDictionary(reflection.GetRepeatedMessage(message, &field, k), *named.field(i)->message_type()));
      dictionary.set(field.name(), std::move(list));
    }
  }
  return dictionary;
}

OtherSender::OtherSender() : factory_(&pool_) {
  std::set<std::string> added;
  for (const MessageTable* table : allMessageTables()) {
    const std::string name = "quorl.schema." + std::string(table->className);
    const Descriptor* descriptor = DescriptorPool::generated_pool()->FindMessageTypeByName(name);
    if (descriptor == nullptr) throw std::logic_error(name + ": not in the schema");
    addTurned(*descriptor->file(), pool_, added);
  }
}

std::unique_ptr<Message> OtherSender::newMessage(std::string_view className) const {
  const Descriptor* descriptor = pool_.FindMessageTypeByName("quorl.schema." + std::string(className));
  if (descriptor == nullptr) throw std::logic_error(std::string(className) + ": not in the schema");
  return std::unique_ptr<Message>(factory_.GetPrototype(descriptor)->New());
}

const OtherSender& OtherSender::shared() {
  static const OtherSender sender;
  return sender;
}

}  // namespace quorl::test
