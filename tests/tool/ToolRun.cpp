#include "ToolRun.h"

#include <cerrno>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>

#include "support/TemporaryDirectory.h"

namespace quorl::test {
namespace {

std::vector<std::string> linesOf(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

/// Standard streams as files.
class FileActions {
 public:
  FileActions() { posix_spawn_file_actions_init(&actions_); }
  ~FileActions() { posix_spawn_file_actions_destroy(&actions_); }
  FileActions(const FileActions&) = delete;
  FileActions& operator=(const FileActions&) = delete;

  void open(int descriptor, const std::filesystem::path& file, int flags) {
    posix_spawn_file_actions_addopen(&actions_, descriptor, file.c_str(), flags, 0600);
  }
  const posix_spawn_file_actions_t* get() const { return &actions_; }

 private:
  posix_spawn_file_actions_t actions_{};
};

std::vector<char*> pointers(std::vector<std::string>& texts) {
  std::vector<char*> result;
  for (std::string& text : texts) result.push_back(text.data());
  result.push_back(nullptr);
  return result;
}

}  // namespace

std::vector<std::string> ToolResult::outputLines() const {
  return linesOf(output);
}

std::vector<std::string> ToolResult::errorLines() const {
  return linesOf(errors);
}

void PrintTo(const ToolResult& result, std::ostream* out) {
  *out << "exit " << result.exitCode << "\noutput: " << result.output << "\nerrors: " << result.errors;
}

ToolResult runProgram(const std::filesystem::path& program, const std::vector<std::string>& arguments,
                      std::string_view input) {
  const TemporaryDirectory directory;
  const auto inputFile = directory.path() / "input";
  const auto outputFile = directory.path() / "output";
  const auto errorFile = directory.path() / "errors";
  writeFile(inputFile, input);
  FileActions actions;
  actions.open(0, inputFile, O_RDONLY);
  actions.open(1, outputFile, O_WRONLY | O_CREAT);
  actions.open(2, errorFile, O_WRONLY | O_CREAT);

  std::vector<std::string> words{program.string()};
  words.insert(words.end(), arguments.begin(), arguments.end());
  std::vector<std::string> environment{"TZ=UTC", "LC_ALL=C.UTF-8", "PATH=/usr/bin:/bin"};
  pid_t child = 0;
  const int error = posix_spawn(&child, program.c_str(), actions.get(), nullptr, pointers(words).data(),
                                pointers(environment).data());
  if (error != 0) throw std::runtime_error("cannot run " + program.string());
  int status = 0;
  while (waitpid(child, &status, 0) < 0)
    if (errno != EINTR) throw std::runtime_error("lost " + program.string());

  ToolResult result;
  result.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
  result.output = readFile(outputFile);
  result.errors = readFile(errorFile);
  return result;
}

ToolResult runTool(const std::vector<std::string>& arguments, std::string_view input) {
  return runProgram(QUORL_TOOL, arguments, input);
}

std::filesystem::path sourcePath(std::string_view relative) {
  return std::filesystem::path(QUORL_SOURCE_DIR) / relative;
}

void writeFile(const std::filesystem::path& file, std::string_view content) {
  std::ofstream output(file, std::ios::binary);
  output << content;
  if (!output.flush()) throw std::runtime_error("cannot write " + file.string());
}

std::string readFile(const std::filesystem::path& file) {
  std::ifstream input(file, std::ios::binary);
  if (!input) throw std::runtime_error("cannot read " + file.string());
  return {std::istreambuf_iterator<char>(input), {}};
}

}  // namespace quorl::test
