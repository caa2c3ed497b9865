#pragma once

#include <filesystem>
#include <ostream>
#include <string>
#include <string_view>
#include <vector>

namespace quorl::test {

/// What a finished program left behind.
struct ToolResult {
  int exitCode = 0;  // minus the signal's number for a program that a signal has ended
  std::string output;
  std::string errors;

  std::vector<std::string> outputLines() const;
  std::vector<std::string> errorLines() const;
};

/// For failure messages of GoogleTest.
void PrintTo(const ToolResult& result, std::ostream* out);

/// Runs a program to its end, in UTC and the plain locale.
ToolResult runProgram(const std::filesystem::path& program, const std::vector<std::string>& arguments,
                      std::string_view input = {});

/// Runs the built quorl-tool.
ToolResult runTool(const std::vector<std::string>& arguments, std::string_view input = {});

std::filesystem::path sourcePath(std::string_view relative);
void writeFile(const std::filesystem::path& file, std::string_view content);
std::string readFile(const std::filesystem::path& file);

}  // namespace quorl::test
