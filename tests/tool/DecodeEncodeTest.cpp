#include <string>

#include <gtest/gtest.h>

#include "ToolRun.h"

namespace quorl::test {
namespace {

constexpr char kExamplePayload[] = "08e8071002320508ac021005380750017801";
constexpr char kExampleJson[] =
    R"({"timestamp":1000,"reg_status":"KREG_STATUS_LIMITED_SERVICE","guti":{"mmegi":300,"mmec":5},)"
    R"("reject_cause":"EMM_CAUSE_EPS_SERVICES_NOT_ALLOWED","is_ims_voice_supported":true,"subs_id":1})";

ToolResult decode(const std::string& className, const std::string& input) {
  return runTool({"decode", "--class", className}, input);
}

ToolResult encode(const std::string& className, const std::string& input) {
  return runTool({"encode", "--class", className}, input);
}

std::string encodeFault(const std::string& json) {
  const ToolResult result = encode("KCellularEmmContext", json + "\n");
  EXPECT_EQ(result.exitCode, 1) << json;
  EXPECT_EQ(result.output, "") << json;
  return result.errors;
}

TEST(ToolDecode, PrintsTheExampleMessage) {
  const ToolResult result = decode("KCellularEmmContext", std::string(kExamplePayload) + "\n");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.output, std::string(kExampleJson) + "\n");
  EXPECT_EQ(result.errors, "");
}

TEST(ToolDecode, TakesEitherCaseBlanksAndAnotherLineEnd) {
  EXPECT_EQ(decode("Guti", "08AC021005\n08ac021005\r\n08 AC 02 10 05").output,
            "{\"mmegi\":300,\"mmec\":5}\n{\"mmegi\":300,\"mmec\":5}\n{\"mmegi\":300,\"mmec\":5}\n");
}

TEST(ToolDecode, ReadsListsInBothForms) {
  EXPECT_EQ(decode("KCellularGsmCsRfMeasurement", "2A020504\n28052804\n").output,
            "{\"cs_tx_pwr\":[-3,2]}\n{\"cs_tx_pwr\":[-3,2]}\n");
}

TEST(ToolDecode, EmptyLineIsAnEmptyPayload) {
  const ToolResult result = decode("KCellularGsmCsRfMeasurement", "\n");
  EXPECT_EQ(result.output, "{\"cs_tx_pwr\":[]}\n");
  EXPECT_EQ(result.exitCode, 0);
}

TEST(ToolDecode, ShowsBytesTextsAndUnknownEnumerators) {
  EXPECT_EQ(decode("KCellularTrackingAreaId", "0A0300F110\n").output, "{\"encoded_plmn\":{\"$bytes\":\"00f110\"}}\n");
  EXPECT_EQ(decode("BearerContext", "1A03696D73205A\n").output, "{\"apn\":\"ims\",\"pdp_type\":\"(unknown: 90)\"}\n");
}

TEST(ToolDecode, ShowsTheWholeRangeOfIntegers) {
  EXPECT_EQ(decode("Guti", "18FFFFFFFF0F\n").output, "{\"m_tmsi\":4294967295}\n");
  EXPECT_EQ(decode("KCellularEmmContext", "08FFFFFFFFFFFFFFFFFF01\n").output, "{\"timestamp\":18446744073709551615}\n");
}

TEST(ToolDecode, PrintsNullForAPayloadThatCannotBeReadWhole) {
  const ToolResult result = decode("KCellularEmmContext", "08\n3205\n08E807320A08AC02\n08E807\n");
  EXPECT_EQ(result.output, "null\nnull\nnull\n{\"timestamp\":1000}\n");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.errors, "");
}

TEST(ToolDecode, ReportsALineThatIsNotHexadecimalAndGoesOn) {
  const ToolResult result = decode("Guti", "0\n0801\nxy\n0 8\n");
  EXPECT_EQ(result.output, "null\n{\"mmegi\":1}\nnull\nnull\n");
  EXPECT_EQ(result.errors,
            "quorl-tool: line 1: not hexadecimal\nquorl-tool: line 3: not hexadecimal\n"
            "quorl-tool: line 4: not hexadecimal\n");
  EXPECT_EQ(result.exitCode, 1);
}

TEST(ToolDecode, NoInputGivesNoOutput) {
  const ToolResult result = decode("Guti", "");
  EXPECT_EQ(result.output, "");
  EXPECT_EQ(result.exitCode, 0);
}

TEST(ToolEncode, WritesTheExampleMessage) {
  const ToolResult result = encode("KCellularEmmContext", std::string(kExampleJson) + "\n");
  EXPECT_EQ(result.output, std::string(kExamplePayload) + "\n");
  EXPECT_EQ(result.exitCode, 0);
}

TEST(ToolEncode, WritesInTheOrderOfTheTableWhateverTheOrderOfTheInput) {
  EXPECT_EQ(encode("KCellularEmmContext", R"({"is_emerg_bearer_supported":true,"subs_id":1,"timestamp":1000})"
                                          "\n")
                .output,
            "08e80778015801\n");
}

TEST(ToolEncode, TakesEnumeratorsByNameByNumberAndAsShownWithoutName) {
  EXPECT_EQ(encode("KCellularEmmContext",
                   "{\"reg_status\":\"KREG_STATUS_SUSPENDED\"}\n{\"reg_status\":100}\n"
                   "{\"reg_status\":\"(unknown: 55)\"}\n{\"reg_status\":\"(unknown: -1)\"}\n")
                .output,
            "1064\n1064\n1037\n10ffffffffffffffffff01\n");
}

TEST(ToolEncode, WritesListsChildrenBytesAndTexts) {
  EXPECT_EQ(encode("KCellularGsmCsRfMeasurement", "{\"cs_tx_pwr\":[-3,2]}\n{\"cs_tx_pwr\":[]}\n").output,
            "2a020504\n\n");
  EXPECT_EQ(encode("KCellularEmmContext", R"({"tai_list":[{"encoded_plmn":{"$bytes":"00F110"},"tac":1},{}]})"
                                          "\n")
                .output,
            "2a070a0300f11010012a00\n");
  EXPECT_EQ(encode("BearerContext", "{\"apn\":\"ims\"}\n{\"apn\":\"\"}\n").output, "1a03696d73\n1a00\n");
}

TEST(ToolEncode, SaysWhatIsWrongAndWhere) {
  EXPECT_EQ(encodeFault("nonsense"), "quorl-tool: line 1: not JSON\n");
  EXPECT_EQ(encodeFault(""), "quorl-tool: line 1: not JSON\n");
  EXPECT_EQ(encodeFault("[]"), "quorl-tool: line 1: KCellularEmmContext: a JSON object is wanted\n");
  EXPECT_EQ(encodeFault("null"), "quorl-tool: line 1: KCellularEmmContext: a JSON object is wanted\n");
  EXPECT_EQ(encodeFault(R"({"timestmp":1})"),
            "quorl-tool: line 1: KCellularEmmContext: there is no field \"timestmp\"\n");
  EXPECT_EQ(encodeFault(R"({"guti":{"a\nb":1}})"), "quorl-tool: line 1: guti: there is no field \"a\\nb\"\n");
  EXPECT_EQ(encodeFault(R"({"subs_id":-1})"),
            "quorl-tool: line 1: subs_id: -1 is out of range, which is 0 to 4294967295\n");
  EXPECT_EQ(encodeFault(R"({"timestamp":18446744073709551616})"),
            "quorl-tool: line 1: timestamp: a whole number is wanted, not 1.8446744073709552e+19\n");
  EXPECT_EQ(encodeFault(R"({"subs_id":1.0})"), "quorl-tool: line 1: subs_id: a whole number is wanted, not 1.0\n");
  EXPECT_EQ(encodeFault(R"({"subs_id":null})"), "quorl-tool: line 1: subs_id: a whole number is wanted, not null\n");
  EXPECT_EQ(encodeFault(R"({"reg_status":"NORMAL"})"),
            "quorl-tool: line 1: reg_status: there is no enumerator \"NORMAL\"\n");
  EXPECT_EQ(encodeFault("{\"reg_status\":\"(unknown: 4294967296)\"}"),
            "quorl-tool: line 1: reg_status: there is no enumerator \"(unknown: 4294967296)\"\n");
  EXPECT_EQ(encodeFault(R"({"is_ims_voice_supported":1})"),
            "quorl-tool: line 1: is_ims_voice_supported: true or false is wanted, not 1\n");
  EXPECT_EQ(encodeFault(R"({"guti":5})"), "quorl-tool: line 1: guti: a JSON object is wanted\n");
  EXPECT_EQ(encodeFault(R"({"tai_list":{}})"), "quorl-tool: line 1: tai_list: a list is wanted\n");
  EXPECT_EQ(encodeFault(R"({"tai_list":[{},{"tac":"1"}]})"),
            "quorl-tool: line 1: tai_list[1].tac: a whole number is wanted, not \"1\"\n");
  EXPECT_EQ(encodeFault(R"({"tai_list":[{"encoded_plmn":"00F110"}]})"),
            "quorl-tool: line 1: tai_list[0].encoded_plmn: {\"$bytes\":\"<hexadecimal>\"} is wanted\n");
  EXPECT_EQ(encodeFault(R"({"tai_list":[{"encoded_plmn":{"$bytes":"0"}}]})"),
            "quorl-tool: line 1: tai_list[0].encoded_plmn: {\"$bytes\":\"<hexadecimal>\"} is wanted\n");
}

TEST(ToolEncode, LeavesOutABadLineAndGoesOn) {
  const ToolResult result = encode("Guti", "{\"mmegi\":1}\n{\"mmegi\":-1}\n{\"mmec\":2}\n");
  EXPECT_EQ(result.output, "0801\n1002\n");
  EXPECT_EQ(result.errors, "quorl-tool: line 2: mmegi: -1 is out of range, which is 0 to 4294967295\n");
  EXPECT_EQ(result.exitCode, 1);
}

TEST(ToolEncode, RefusesDeepNesting) {
  const std::string deep = std::string(100000, '[') + std::string(100000, ']');
  EXPECT_EQ(encodeFault(R"({"subs_id":)" + deep + "}"), "quorl-tool: line 1: nested deeper than 100\n");
  EXPECT_EQ(encodeFault(std::string(200000, '[')), "quorl-tool: line 1: nested deeper than 100\n");
  const std::string deepest = std::string(99, '[') + std::string(99, ']');
  EXPECT_EQ(encodeFault(R"({"subs_id":)" + deepest + "}"),
            "quorl-tool: line 1: subs_id: a whole number is wanted, not " + std::string(60, '[') + "...\n");
  EXPECT_EQ(encode("BearerContext", R"({"apn":"\")" + std::string(200, '[') + "\"}\n").exitCode, 0)
      << "brackets in a text are none";
}

TEST(ToolEncode, CutsLongTexts) {
  const ToolResult result = encode("Guti", R"({"mmegi":")" + std::string(100000, 'x') + "\"}\n");
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_LT(result.errors.size(), 300U);
}

TEST(ToolStandardInput, ThatCannotBeReadIsAFailure) {
  for (const std::string command : {"decode", "encode"}) {
    const ToolResult result =
        runProgram("/bin/sh", {"-c", "\"$0\" " + command + " --class KCellularEmmContext < /", QUORL_TOOL});
    EXPECT_EQ(result.exitCode, 1);
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.errors, "quorl-tool: standard input cannot be read to its end\n");
  }
}

TEST(ToolStandardInput, IsReadNoFurtherThanItsOutputIsTaken) {
  const ToolResult result = runProgram(
      "/bin/sh", {"-c", "yes 0801 2>/dev/null | \"$0\" decode --class KCellularEmmContext > /dev/full", QUORL_TOOL});
  EXPECT_EQ(result.exitCode, 1);
  EXPECT_EQ(result.errors, "quorl-tool: standard output cannot be written\n");
}

}  // namespace
}  // namespace quorl::test
