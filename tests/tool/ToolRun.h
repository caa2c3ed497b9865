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

/// Runs a program to its end, in UTC and the plain locale, with `input` on its standard input. Throws
/// std::runtime_error when it cannot be started.
ToolResult runProgram(const std::filesystem::path& program, const std::vector<std::string>& arguments,
                      std::string_view input = {});

/// Runs the built quorl-tool.
ToolResult runTool(const std::vector<std::string>& arguments, std::string_view input = {});

/// A file of the source tree.
std::filesystem::path sourcePath(std::string_view relative);
// Both throw std::runtime_error when they cannot.
void writeFile(const std::filesystem::path& file, std::string_view content);
std::string readFile(const std::filesystem::path& file);

}  // namespace quorl::test
