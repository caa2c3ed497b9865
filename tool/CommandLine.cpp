#include "CommandLine.h"

#include <cstdint>
#include <iostream>
#include <limits>
#include <optional>
#include <string_view>
#include <utility>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Commands.h"
#include "hosts/simulator/OptionNumber.h"

namespace quorl::tool {
namespace {

/// The first line of what the parser says; nobody needs its hint at --help a second time.
std::string oneLine(const std::string& text) {
  return text.substr(0, text.find('\n'));
}

/// What is wrong with the command line, in one line.
std::string faultText(const CLI::App& tool, const CLI::ParseError& error, int argc, char** argv) {
  // The parser misses a subcommand before it looks at what stands in its place.
  const std::string_view first = argc > 1 ? argv[1] : "";
  if (tool.get_subcommands().empty() && !first.empty() && !first.starts_with('-'))
    return fmt::format("there is no subcommand \"{}\"", first);
  return oneLine(error.what());
}

}  // namespace

CommandOption& CommandOption::required() {
  option_->required();
  return *this;
}

CommandOption& CommandOption::oneOf(std::initializer_list<const char*> names) {
  option_->check(CLI::IsMember(std::vector<std::string>(names.begin(), names.end())));
  return *this;
}

CommandOption& CommandOption::oneOf(std::initializer_list<int> numbers) {
  option_->check(CLI::IsMember(numbers));
  return *this;
}

CommandOption& CommandOption::notEmpty() {
  option_->check([](const std::string& text) { return text.empty() ? "must not be empty" : std::string(); });
  return *this;
}

CommandOption& CommandOption::wholeWithin(std::uint64_t least, std::uint64_t most) {
  // The limits of a type say nothing to a reader of the help.
  const bool isLimit = std::in_range<std::int64_t>(most) && most < std::numeric_limits<std::int64_t>::max();
  option_->transform(CLI::Validator([=](std::string& text) { return simulator::wholeNumberFault(text, least, most); },
                                    isLimit ? fmt::format("{} to {}", least, most) : std::string()));
  return *this;
}

CommandOption& CommandOption::within(double least, double most) {
  option_->check([=](const std::string& text) { return simulator::numberFault(text, least, most); },
                 fmt::format("{} to {}", least, most));
  return *this;
}

CommandOption& CommandOption::showDefault() {
  option_->capture_default_str();
  return *this;
}

bool CommandOption::isGiven() const {
  return option_->count() > 0;
}

void Command::setFooter(const std::string& text) {
  app_->footer(text);
}

void Command::hide() {
  app_->group("");
}

template <typename T>
CommandOption Command::addOption(const std::string& name, T& value, const std::string& description) {
  return CommandOption(*app_->add_option(name, value, description));
}

template CommandOption Command::addOption(const std::string&, std::string&, const std::string&);
template CommandOption Command::addOption(const std::string&, std::optional<std::string>&, const std::string&);
template CommandOption Command::addOption(const std::string&, std::vector<std::string>&, const std::string&);
template CommandOption Command::addOption(const std::string&, int&, const std::string&);
template CommandOption Command::addOption(const std::string&, std::uint64_t&, const std::string&);
template CommandOption Command::addOption(const std::string&, std::optional<std::int64_t>&, const std::string&);
template CommandOption Command::addOption(const std::string&, std::vector<std::size_t>&, const std::string&);
template CommandOption Command::addOption(const std::string&, double&, const std::string&);

void Command::addFlag(const std::string& name, bool& value, const std::string& description) {
  app_->add_flag(name, value, description);
}

void Command::setAction(Action action) {
  app_->callback([chosen = chosen_, action = std::move(action)] { *chosen = action; });
}

CommandLine::CommandLine(const std::string& description, const std::string& name)
    : app_(std::make_unique<CLI::App>(description, name)) {
  app_->require_subcommand(1);
  app_->set_version_flag("--version", name + " " QUORL_VERSION, "Print the version and exit");
}

CommandLine::~CommandLine() = default;

Command CommandLine::addCommand(const std::string& name, const std::string& description) {
  return {*app_->add_subcommand(name, description), chosen_};
}

int CommandLine::run(int argc, char** argv) {
  try {
    app_->parse(argc, argv);
  } catch (const CLI::CallForHelp&) {
    std::cout << app_->help();
    return kSuccess;
  } catch (const CLI::CallForVersion& version) {
    std::cout << version.what() << '\n';
    return kSuccess;
  } catch (const CLI::ParseError& error) {
    complain(faultText(*app_, error, argc, argv) + " (see quorl-tool --help)");
    return kWrongUse;
  }
  return chosen_();
}

}  // namespace quorl::tool
