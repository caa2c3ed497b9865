#include <stdexcept>
#include <string>

#include <google/protobuf/descriptor.pb.h>
#include <google/protobuf/text_format.h>
#include <gtest/gtest.h>

#include "messages/generator/Fields.h"
#include "messages/generator/HeaderEmitter.h"
#include "messages/generator/Names.h"
#include "messages/generator/SourceEmitter.h"

namespace quorl::generator {
namespace {

/// Schema files given as descriptors in text form.
class GeneratorTest : public testing::Test {
 protected:
  const google::protobuf::FileDescriptor& file(const std::string& content) {
    google::protobuf::FileDescriptorProto proto;
    if (!google::protobuf::TextFormat::ParseFromString("name: 'sample.proto' " + content, &proto))
      throw std::logic_error("sample cannot be parsed");
    const auto* built = pool_.BuildFile(proto);
    if (built == nullptr) throw std::logic_error("sample cannot be built");
    return *built;
  }
  /// A file with one message `Sample` of one field.
  const google::protobuf::FileDescriptor& fileWithField(const std::string& field) {
    return file("message_type { name: 'Sample' field { number: 1 " + field +
                " } } enum_type { name: 'Kind' "
                "value { name: 'NO_KIND' number: 0 } }");
  }
  std::string refusal(const google::protobuf::FileDescriptor& sample) {
    try {
      messagesOf(sample);
    } catch (const std::runtime_error& error) {
      return error.what();
    }
    return "accepted";
  }

 private:
  google::protobuf::DescriptorPool pool_;
};

bool contains(const std::string& text, const std::string& part) {
  return text.find(part) != std::string::npos;
}

TEST(CamelCaseTest, UnderscoresGoAndTheNextCharacterRises) {
  EXPECT_EQ(camelCase("timestamp"), "timestamp");
  EXPECT_EQ(camelCase("subs_id"), "subsId");
  EXPECT_EQ(camelCase("t3412_dur_s"), "t3412DurS");
  EXPECT_EQ(camelCase("si_7_8_broadcast"), "si78Broadcast");
  EXPECT_EQ(camelCase("idle_rxlev_dBm"), "idleRxlevDBm");
}

TEST(CamelCaseTest, FirstCharacterFalls) {
  EXPECT_EQ(camelCase("Q_hyst"), "qHyst");
  EXPECT_EQ(camelCase("MCC"), "mCC");
  EXPECT_EQ(camelCase("QRxLevMin"), "qRxLevMin");
}

TEST(CamelCaseTest, UnderscoresAtTheEdges) {
  EXPECT_EQ(camelCase("_a__b_"), "aB");
  EXPECT_EQ(camelCase(""), "");
}

TEST_F(GeneratorTest, EveryFileBeginsWithTheBanner) {
  const auto& sample = fileWithField("name: 'a' label: LABEL_OPTIONAL type: TYPE_UINT32");
  const std::string banner = "// Made by the message generator from sample.proto. Do not edit.\n";
  EXPECT_EQ(emitHeader(sample).substr(0, banner.size()), banner);
  EXPECT_EQ(emitSource(sample).substr(0, banner.size()), banner);
  EXPECT_TRUE(contains(emitRegistry({&sample}).substr(0, 100), "Do not edit."));
}

TEST_F(GeneratorTest, RepeatedFieldHasAPluralMember) {
  const auto& sample = fileWithField("name: 'rx_bin' label: LABEL_REPEATED type: TYPE_SINT32");
  const std::string header = emitHeader(sample);
  for (const char* declaration :
       {"const std::int32_t* rxBins() const", "rxBinsCount() const", "void clearRxBins()", "void addRxBin(",
        "void setRxBins(const std::int32_t* values, std::size_t count)", "rxBinAtIndex(std::size_t index) const"})
    EXPECT_TRUE(contains(header, declaration)) << declaration;
}

TEST_F(GeneratorTest, TableKeepsTheOrderOfTheDeclarations) {
  const std::string source =
      emitSource(file("message_type { name: 'Sample' "
                      "field { name: 'b' number: 2 label: LABEL_OPTIONAL type: TYPE_BOOL } "
                      "field { name: 'a' number: 1 label: LABEL_OPTIONAL type: TYPE_BOOL } }"));
  EXPECT_LT(source.find("\"b\""), source.find("\"a\""));
  EXPECT_TRUE(contains(source, "kIndexByTag[] = {0, 2, 1}"));
}

TEST_F(GeneratorTest, DefaultOfAnEnumerationIsItsFirstEnumeratorWhateverItsValue) {
  const std::string source =
      emitSource(file("enum_type { name: 'Kind' value { name: 'B' number: 5 } value { name: 'A' number: -1 } }"));
  EXPECT_TRUE(contains(source, "enum_table::Kind{kKindEntries, 5}"));
  EXPECT_LT(source.find("\"A\""), source.find("\"B\"")) << "the table is ascending by value";
}

TEST_F(GeneratorTest, NumberTypesOutsideTheMessageModelAreRefused) {
  EXPECT_EQ(refusal(fileWithField("name: 'a' label: LABEL_OPTIONAL type: TYPE_DOUBLE")),
            "Sample.a: this type is not offered");
}

TEST_F(GeneratorTest, SixtyFourBitSignedNumbersAreRefused) {
  EXPECT_EQ(refusal(fileWithField("name: 'a' label: LABEL_OPTIONAL type: TYPE_INT64")),
            "Sample.a: this type is not offered");
}

TEST_F(GeneratorTest, RepeatedEnumerationsAreRefused) {
  EXPECT_EQ(refusal(fileWithField("name: 'a' label: LABEL_REPEATED type: TYPE_ENUM type_name: '.Kind'")),
            "Sample.a: a repeated enumeration is not offered");
}

TEST_F(GeneratorTest, RepeatedTextsAreRefused) {
  EXPECT_EQ(refusal(fileWithField("name: 'a' label: LABEL_REPEATED type: TYPE_STRING")),
            "Sample.a: repeated texts and byte strings are not offered");
}

TEST_F(GeneratorTest, NamesOfTheBaseClassAreRefused) {
  EXPECT_EQ(refusal(fileWithField("name: 'read_from' label: LABEL_OPTIONAL type: TYPE_UINT32")),
            "Sample.read_from: the member name is taken; give it another with the option `member`");
}

class GeneratorKeywordTest : public GeneratorTest, public testing::WithParamInterface<const char*> {};

TEST_P(GeneratorKeywordTest, IsRefusedAsTheNameOfAField) {
  const std::string keyword = GetParam();
  EXPECT_EQ(refusal(fileWithField("name: '" + keyword + "' label: LABEL_OPTIONAL type: TYPE_UINT32")),
            "Sample." + keyword + ": the member name is taken; give it another with the option `member`");
}

INSTANTIATE_TEST_SUITE_P(Keywords, GeneratorKeywordTest, testing::Values("class", "struct", "while", "true"),
                         [](const auto& keyword) { return std::string(keyword.param); });

TEST_F(GeneratorTest, MessageThatContainsItselfIsRefused) {
  EXPECT_EQ(refusal(fileWithField("name: 'a' label: LABEL_OPTIONAL type: TYPE_MESSAGE type_name: '.Sample'")),
            "Sample: contains itself");
}

TEST_F(GeneratorTest, MessageThatHoldsAnotherTwiceIsFine) {
  EXPECT_EQ(refusal(file("message_type { name: 'Inner' field { name: 'a' number: 1 label: LABEL_OPTIONAL "
                         "type: TYPE_BOOL } } message_type { name: 'Outer' "
                         "field { name: 'a' number: 1 label: LABEL_OPTIONAL type: TYPE_MESSAGE type_name: '.Inner' } "
                         "field { name: 'b' number: 2 label: LABEL_REPEATED type: TYPE_MESSAGE type_name: '.Inner' } "
                         "}")),
            "accepted");
}

}  // namespace
}  // namespace quorl::generator
