#include "messages/RandomMessage.h"

#include <iterator>
#include <limits>
#include <stdexcept>
#include <string>
#include <type_traits>

namespace quorl::test {

using google::protobuf::DescriptorPool;
using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using google::protobuf::MessageFactory;
using google::protobuf::Reflection;

namespace {

class Filler {
 public:
  Filler(std::mt19937_64& random, const RandomShape& shape) : random_(random), shape_(shape) {}

  void fill(Message& message) {
    const auto& descriptor = *message.GetDescriptor();
    for (int i = 0; i < descriptor.field_count(); ++i) {
      const FieldDescriptor& field = *descriptor.field(i);
      if (field.is_repeated()) {
        for (std::uint64_t left = below(shape_.maxElements + 1); left > 0; --left) fillField(message, field);
      } else if (below(100) < shape_.presencePercent) {
        fillField(message, field);
      }
    }
  }

 private:
  std::uint64_t below(std::uint64_t limit) { return random_() % limit; }

  /// Any width is as likely as any other, as in real messages.
  template <typename T>
  T number() {
    constexpr unsigned kBits = sizeof(T) * 8;
    if (below(100) < shape_.extremePercent) {
      const T extremes[] = {0, std::numeric_limits<T>::min(), std::numeric_limits<T>::max()};
      return extremes[below(std::size(extremes))];
    }
    using Bits = std::make_unsigned_t<T>;
    const auto value = static_cast<Bits>(static_cast<Bits>(random_()) >> below(kBits));
    return static_cast<T>(std::is_signed_v<T> && below(2) == 0 ? ~value : value);
  }

  std::string text(bool isUtf8) {
    if (below(100) < shape_.extremePercent) return {};
    const std::string_view pieces[] = {"a", "Z", "7", " ", "\u00FC", "\u20AC", "\U0001F4F1"};
    std::string result;
    for (std::uint64_t left = 1 + below(16); left > 0; --left) {
      if (isUtf8)
        result += pieces[below(std::size(pieces))];
      else
        result += static_cast<char>(below(256));
    }
    return result;
  }

  void fillField(Message& message, const FieldDescriptor& field) {
    const Reflection& reflection = *message.GetReflection();
    const bool isRepeated = field.is_repeated();
    switch (field.cpp_type()) {
      case FieldDescriptor::CPPTYPE_UINT32:
        isRepeated ? reflection.AddUInt32(&message, &field, number<std::uint32_t>())
                   : reflection.SetUInt32(&message, &field, number<std::uint32_t>());
        return;
      case FieldDescriptor::CPPTYPE_UINT64:
        isRepeated ? reflection.AddUInt64(&message, &field, number<std::uint64_t>())
                   : reflection.SetUInt64(&message, &field, number<std::uint64_t>());
        return;
      case FieldDescriptor::CPPTYPE_INT32:
        isRepeated ? reflection.AddInt32(&message, &field, number<std::int32_t>())
                   : reflection.SetInt32(&message, &field, number<std::int32_t>());
        return;
      case FieldDescriptor::CPPTYPE_BOOL:
        reflection.SetBool(&message, &field, below(2) == 1);
        return;
      case FieldDescriptor::CPPTYPE_ENUM: {
        const auto& values = *field.enum_type();
        const auto index = below(static_cast<std::uint64_t>(values.value_count()));
        reflection.SetEnum(&message, &field, values.value(static_cast<int>(index)));
        return;
      }
      case FieldDescriptor::CPPTYPE_STRING:
        reflection.SetString(&message, &field, text(field.type() == FieldDescriptor::TYPE_STRING));
        return;
      case FieldDescriptor::CPPTYPE_MESSAGE:
        fill(isRepeated ? *reflection.AddMessage(&message, &field) : *reflection.MutableMessage(&message, &field));
        return;
      default:
        throw std::logic_error(field.full_name() + ": no such kind in the schema");
    }
  }

  std::mt19937_64& random_;
  const RandomShape& shape_;
};

}  // namespace

std::unique_ptr<Message> newProtobufMessage(std::string_view className) {
  const auto* descriptor =
      DescriptorPool::generated_pool()->FindMessageTypeByName("quorl.schema." + std::string(className));
  if (descriptor == nullptr) return nullptr;
  return std::unique_ptr<Message>(MessageFactory::generated_factory()->GetPrototype(descriptor)->New());
}

void fillRandomly(Message& message, std::mt19937_64& random, const RandomShape& shape) {
  Filler(random, shape).fill(message);
}

}  // namespace quorl::test
