#include <cstdint>
#include <set>
#include <string>

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "ToolRun.h"

namespace quorl::test {
namespace {

TEST(ToolCatalogue, PrintsTheRowsInTheirOrder) {
  const ToolResult result = runTool({"catalogue"});
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.errors, "");
  const auto lines = result.outputLines();
  ASSERT_EQ(lines.size(), 80U);
  EXPECT_EQ(lines[0], R"({"tech":"5G","name":"NrSys InfoBlocks","zelkorId":806912,"hex":"C5000",)"
                      R"("className":"CellularNrSysInfoBlocks","deviceType":"mav","decodable":true})");
  EXPECT_EQ(lines[79], R"({"tech":"GSM","name":"LTE Neighbor Cell Meas","zelkorId":3985417,"hex":"3CD009",)"
                       R"("className":"kCellularGsmGrrEventMeasCr","deviceType":"ice","decodable":false})");
}

// Twelve rows name a class that does not exist. Two of them belong to metrics whose class is fixed elsewhere.
TEST(ToolCatalogue, SaysWhichRowsCannotBeDecoded) {
  std::multiset<std::int64_t> undecodable;
  for (const std::string& line : runTool({"catalogue"}).outputLines()) {
    const auto row = nlohmann::json::parse(line);
    if (!row["decodable"].get<bool>()) undecodable.insert(row["zelkorId"].get<std::int64_t>());
  }
  EXPECT_EQ(undecodable, (std::multiset<std::int64_t>{802315, 835591, 836134, 3985409, 3985410, 3985411, 3985420,
                                                      3985417, 3985417, 3985417}));
}

}  // namespace
}  // namespace quorl::test
