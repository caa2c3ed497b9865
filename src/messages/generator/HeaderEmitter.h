#pragma once

#include <string>

#include <google/protobuf/descriptor.h>

namespace quorl::generator {

/// The header of a schema file: its enumerations and message classes.
std::string emitHeader(const google::protobuf::FileDescriptor& file);

/// First line of every generated file.
std::string banner(const std::string& madeFrom);

}  // namespace quorl::generator
