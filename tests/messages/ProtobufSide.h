#pragma once

#include <memory>
#include <string>
#include <string_view>

#include <google/protobuf/dynamic_message.h>
#include <google/protobuf/message.h>

#include "messages/MetricDictionary.h"

namespace quorl::test {

/// What a message with libprotobuf's content must show as its dictionary: an entry for each present field and each
/// repeated scalar. Enumerations that `message` holds as numbers are named by `named`, the class as the schema has it.
MetricDictionary expectedDictionary(const google::protobuf::Message& message,
                                    const google::protobuf::Descriptor& named);

/// The schema with each list packed that is not, none packed that is, and with plain int32 for each enumeration: what
/// another sender may write for the same classes.
class OtherSender {
 public:
  OtherSender();
  /// A new message of the class of this name; the pool's owner outlives it.
  std::unique_ptr<google::protobuf::Message> newMessage(std::string_view className) const;

  static const OtherSender& shared();

 private:
  google::protobuf::DescriptorPool pool_;
  mutable google::protobuf::DynamicMessageFactory factory_;
};

}  // namespace quorl::test
