#pragma once

#include <string>

namespace quorl::simulator {

/// Codes with which the simulated baseband manager answers a command. 0 is success.
enum class CommandCode {
  Success = 0,
  ForeignManager = 1,            // the handle was not made by this library
  UnknownCommand = 2,            // no command of that name
  MissingKey = 3,                // a key that the command must carry is not there
  UnexpectedKey = 4,             // a key that the command does not carry
  WrongType = 5,                 // a value of another type than the key's
  UnknownApplication = 6,        // an application id other than 2
  UnknownPayloadType = 7,        // a payload type other than 0
  EmptyConfiguration = 8,        // a configuration without content
  MissingConfiguration = 9,      // a query while no configuration is added
  UnreadableConfiguration = 10,  // a configuration that is no JSON object
  ConfigurationKey = 11,         // a key of a configuration that is missing, not known or of another type
  ConfigurationValue = 12,       // a value of a configuration that the manager cannot serve
  UnknownTrigger = 13,           // a query by a trigger or profile that the configuration does not list
  UnselectedMetric = 14,         // a query for a metric that the configuration does not list
};

/// Why a command is refused: the code, and a text for a person.
struct CommandFault {
  CommandCode code = CommandCode::Success;
  std::string text;
};

}  // namespace quorl::simulator
