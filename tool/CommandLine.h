#pragma once

#include <cstdint>
#include <functional>
#include <initializer_list>
#include <memory>
#include <string>

// A thin face before the option parser, which takes seconds to compile wherever it is included.

namespace CLI {
class App;
class Option;
}  // namespace CLI

namespace quorl::tool {

/// What is to be done when the command line is read; answers the exit code.
using Action = std::function<int()>;

/// A handle of one option of a subcommand.
class CommandOption {
 public:
  explicit CommandOption(CLI::Option& option) : option_(&option) {}

  CommandOption& required();
  /// Nothing but these is let pass.
  CommandOption& oneOf(std::initializer_list<const char*> names);
  CommandOption& oneOf(std::initializer_list<int> numbers);
  /// A text that is not empty.
  CommandOption& notEmpty();
  /// A whole number, both limits included.
  CommandOption& wholeWithin(std::uint64_t least, std::uint64_t most);
  /// A finite number, both limits included.
  CommandOption& within(double least, double most);
  /// Shows the present value of its variable as the default.
  CommandOption& showDefault();

  /// Whether the user has given it; known once the command line is read.
  bool isGiven() const;

 private:
  CLI::Option* option_;
};

/// A handle of one subcommand; the command line owns what it stands for. The variables of options must outlive the
/// reading of the command line.
class Command {
 public:
  Command(CLI::App& app, Action& chosen) : app_(&app), chosen_(&chosen) {}

  /// What stands below the options in its help.
  void setFooter(const std::string& text);
  /// Leaves it out of the help of the whole.
  void hide();
  /// Adds an option, or with a name without dashes a place, whose text becomes `value`. There are instances for the
  /// texts and numbers that the subcommands have.
  template <typename T>
  CommandOption addOption(const std::string& name, T& value, const std::string& description);
  void addFlag(const std::string& name, bool& value, const std::string& description);
  /// What is to be done when the user chooses this subcommand, with its options read.
  void setAction(Action action);

 private:
  CLI::App* app_;
  Action* chosen_;
};

/// The command line of a program with subcommands.
class CommandLine {
 public:
  CommandLine(const std::string& description, const std::string& name);
  ~CommandLine();
  CommandLine(const CommandLine&) = delete;
  CommandLine& operator=(const CommandLine&) = delete;

  Command addCommand(const std::string& name, const std::string& description);
  /// Reads the command line and does what it says: prints the help that it asks for, tells the user in one line what
  /// is wrong with it, or runs the action of the subcommand. Answers the exit code.
  int run(int argc, char** argv);

 private:
  const std::unique_ptr<CLI::App> app_;
  Action chosen_;
};

}  // namespace quorl::tool
