#pragma once

#include <cstdint>
#include <memory>
#include <random>
#include <string_view>

#include <google/protobuf/message.h>

namespace quorl::test {

/// How libprotobuf's messages are filled.
struct RandomShape {
  unsigned presencePercent = 50;  // of each field that is not repeated
  unsigned maxElements = 6;       // of each repeated field; every count from 0 is as likely
  unsigned extremePercent = 20;   // numbers that are 0, the smallest or the largest of their width; empty texts
};

/// A new message of libprotobuf's own class of this name; null when the schema has none.
std::unique_ptr<google::protobuf::Message> newProtobufMessage(std::string_view className);

/// Fills an empty message, its children included. The same random source gives the same message. Enumerations hold
/// values of theirs, since libprotobuf keeps no others.
void fillRandomly(google::protobuf::Message& message, std::mt19937_64& random, const RandomShape& shape);

}  // namespace quorl::test
