#pragma once

#include <string>
#include <vector>

#include <google/protobuf/descriptor.h>

namespace quorl::generator {

/// The source of a schema file: its constant tables and what the header does not define.
std::string emitSource(const google::protobuf::FileDescriptor& file);

/// The source that lists the tables of all classes of all files.
std::string emitRegistry(const std::vector<const google::protobuf::FileDescriptor*>& files);

}  // namespace quorl::generator
