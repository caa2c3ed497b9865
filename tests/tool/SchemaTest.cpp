#include <cstddef>
#include <string>

#include <gtest/gtest.h>

#include "ToolRun.h"
#include "messages/MessageTable.h"
#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

/// What protoc says about a schema; empty when it compiles.
std::string protocComplaint(const std::string& schema) {
  const TemporaryDirectory directory;
  writeFile(directory.path() / "schema.proto", schema);
  const ToolResult result =
      runProgram(QUORL_PROTOC, {"-I", directory.path().string(), "-o", (directory.path() / "out").string(),
                                (directory.path() / "schema.proto").string()});
  return result.exitCode == 0 ? "" : result.errors;
}

std::size_t occurrences(const std::string& text, const std::string& part) {
  std::size_t count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + part.size())) ++count;
  return count;
}

TEST(ToolSchema, PrintsAClassWithItsCommentAndWhatItUses) {
  const ToolResult result = runTool({"schema", "--class", "KCellularTrackingAreaId"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.output,
            "syntax = \"proto2\";\n\npackage quorl.schema;\n\n// A tracking area.\nmessage KCellularTrackingAreaId {\n"
            "  optional bytes encoded_plmn = 1;\n  optional uint32 tac = 2;\n}\n");

  const std::string context = runTool({"schema", "--class", "KCellularEmmContext"}).output;
  for (const char* part : {"message KCellularEmmContext {", "enum KREG_STATUS {", "message Guti {",
                           "message KCellularTrackingAreaId {", "ms since 1970"})
    EXPECT_EQ(occurrences(context, part), 1U) << part;
}

TEST(ToolSchema, LeavesOutTheOptionsOfOurGenerator) {
  const std::string all = runTool({"schema"}).output;
  EXPECT_EQ(all.find("(quorl.schema."), std::string::npos);
  EXPECT_EQ(all.find("import"), std::string::npos);
  EXPECT_EQ(all.find("[]"), std::string::npos);
  EXPECT_NE(all.find("[packed = true];"), std::string::npos);
  EXPECT_NE(all.find("[default = -121];"), std::string::npos);
}

TEST(ToolSchema, AllOfItCompilesAndHoldsEveryClassOnce) {
  const ToolResult result = runTool({"schema"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(protocComplaint(result.output), "");
  for (const MessageTable* table : allMessageTables())
    EXPECT_EQ(occurrences(result.output, "\nmessage " + std::string(table->className) + " {"), 1U) << table->className;
}

TEST(ToolSchema, EveryClassCompilesByItself) {
  for (const MessageTable* table : allMessageTables()) {
    const ToolResult result = runTool({"schema", "--class", std::string(table->className)});
    ASSERT_EQ(result.exitCode, 0) << table->className;
    EXPECT_EQ(protocComplaint(result.output), "") << table->className;
  }
}

}  // namespace
}  // namespace quorl::test
