#include <fstream>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include <fmt/format.h>
#include <google/protobuf/descriptor.h>
#include <gtest/gtest.h>

#include "messages/MessageTable.h"
#include "quorl_options.pb.h"

// Classes and enumerations are what the baseband sends and what rows show, so none of them changes unnoticed.

namespace quorl {
namespace {

constexpr std::size_t kWidth = 120;

/// A paragraph of a title and items, in as few lines as go.
std::string paragraph(const std::string& title, const std::vector<std::string>& items) {
  std::string text = title + ":";
  std::size_t column = text.size();
  for (std::size_t i = 0; i < items.size(); ++i) {
    const std::string item = " " + items[i] + (i + 1 < items.size() ? "," : "");
    if (column + item.size() > kWidth) {
      text += "\n ";
      column = 1;
    }
    text += item;
    column += item.size();
  }
  return text + "\n";
}

/// What the tables do not hold, which the schema's own descriptor knows.
const google::protobuf::FieldDescriptor& described(const MessageTable& table, const FieldEntry& field) {
  const auto* const message = google::protobuf::DescriptorPool::generated_pool()->FindMessageTypeByName(
      fmt::format("quorl.schema.{}", table.className));
  return *message->FindFieldByNumber(static_cast<int>(field.tag));
}

std::string nameOf(const google::protobuf::EnumDescriptor& enumeration) {
  const std::string& option = enumeration.options().GetExtension(schema::enumeration);
  const std::string& name = option.empty() ? enumeration.name() : option;
  const auto* const owner = enumeration.containing_type();
  return owner == nullptr ? name : owner->name() + "." + name;
}

class SchemaListing {
 public:
  SchemaListing() {
    for (const MessageTable* table : allMessageTables()) {
      std::vector<std::string> fields;
      for (const FieldEntry& field : table->fields) fields.push_back(fieldText(*table, field));
      classes_ += paragraph(
          fmt::format("{}{}", table->className, table->acceptsMetricIdTags ? " (accepts metric ids)" : ""), fields);
    }
    for (const auto& [name, table] : enumerations_) {
      std::vector<std::string> entries;
      for (const auto& entry : table->entries) entries.push_back(fmt::format("{} {}", entry.value, entry.name));
      enumerationTexts_ += paragraph(fmt::format("{} (default {})", name, table->defaultValue), entries);
    }
  }

  const std::string& classes() const { return classes_; }
  const std::string& enumerations() const { return enumerationTexts_; }

 private:
  std::string fieldText(const MessageTable& table, const FieldEntry& field) {
    const auto& descriptor = described(table, field);
    std::string text =
        fmt::format("{} {}{} {}", field.tag, field.isPacked ? "packed " : "", typeText(field, descriptor), field.key);
    if (descriptor.has_default_value()) text += fmt::format(" = {}", descriptor.default_value_int32());
    return text;
  }
  std::string typeText(const FieldEntry& field, const google::protobuf::FieldDescriptor& descriptor) {
    switch (field.kind) {
      case FieldKind::UInt32:
        return "uint32";
      case FieldKind::Int32:
        return "int32";
      case FieldKind::Enumeration: {
        std::string name = nameOf(*descriptor.enum_type());
        EXPECT_EQ(enumerations_.emplace(name, field.enumeration).first->second, field.enumeration) << name;
        return name;
      }
      case FieldKind::SInt32:
        return "sint32";
      case FieldKind::UInt64:
        return "uint64";
      case FieldKind::Bool:
        return "bool";
      case FieldKind::Bytes:
        return "bytes";
      case FieldKind::String:
        return "string";
      case FieldKind::Message:
        return std::string(field.message->className);
      case FieldKind::RepeatedMessage:
        return fmt::format("repeated {}", field.message->className);
      case FieldKind::RepeatedUInt32:
        return "repeated uint32";
      case FieldKind::RepeatedUInt64:
        return "repeated uint64";
      case FieldKind::RepeatedSInt32:
        return "repeated sint32";
    }
    return "?";
  }

  std::string classes_;
  std::string enumerationTexts_;
  std::map<std::string, const EnumTable*> enumerations_;
};

/// Compares with the listing of this name, its head of comments aside.
void expectAsListed(const std::string& name, const std::string& present) {
  const std::string path = QUORL_SOURCE_DIR "/tests/messages/" + name;
  std::ifstream file(path);
  ASSERT_TRUE(file) << path;
  std::string head;
  std::string listed;
  for (std::string line; std::getline(file, line);) (line.starts_with('#') ? head : listed) += line + "\n";
  if (listed == present) return;
  const std::string renewed = QUORL_BINARY_DIR "/" + name;
  std::ofstream(renewed) << head << present;
  EXPECT_EQ(listed, present) << "the present listing is in " << renewed;
}

TEST(SchemaListingTest, ClassesAreAsListed) {
  expectAsListed("listed_classes.txt", SchemaListing().classes());
}

TEST(SchemaListingTest, EnumerationsAreAsListed) {
  expectAsListed("listed_enumerations.txt", SchemaListing().enumerations());
}

}  // namespace
}  // namespace quorl
