#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "base/SharedBytes.h"
#include "messages/MetricCodable.h"
#include "messages/MetricDictionary.h"
#include "messages/wire/WireReader.h"
#include "messages/wire/WireWriter.h"

namespace quorl::test {

/// "08 E8 07" as bytes.
inline std::string bytes(std::string_view hex) {
  std::string result;
  int nibbles = 0;
  unsigned value = 0;
  for (const char c : hex) {
    if (c == ' ') continue;
    value = value * 16 + static_cast<unsigned>(c <= '9' ? c - '0' : c - 'A' + 10);
    if (++nibbles % 2 == 0) {
      result += static_cast<char>(value);
      value = 0;
    }
  }
  return result;
}

/// Bytes as "08 E8 07".
inline std::string hex(std::string_view bytes) {
  constexpr std::string_view kDigits = "0123456789ABCDEF";
  std::string result;
  for (const char c : bytes) {
    if (!result.empty()) result += ' ';
    result += kDigits[static_cast<unsigned char>(c) >> 4U];
    result += kDigits[static_cast<unsigned char>(c) & 15U];
  }
  return result;
}

/// Reads a payload, given in hexadecimal, into `message`; the answer is that of `readFrom`.
inline bool read(MetricCodable& message, std::string_view payload) {
  const std::string content = bytes(payload);
  WireReader reader(content);
  return message.readFrom(reader);
}

/// A message of the class of this name, which must exist, made from a payload.
inline std::unique_ptr<MetricCodable> decoded(std::string_view className, std::string_view payload) {
  auto message = makeMessage(className);
  message->initWithData(ByteString(payload));
  return message;
}

/// What `message` writes.
inline std::string encoded(const MetricCodable& message) {
  WireWriter writer;
  message.writeTo(writer);
  return writer.take();
}

/// The same in hexadecimal.
inline std::string written(const MetricCodable& message) {
  return hex(encoded(message));
}

/// The dictionary of a message that was read whole, as its log text; "none" for another.
inline std::string dictionaryText(const MetricCodable& message) {
  const auto dictionary = message.dictionaryRepresentation();
  return dictionary ? logText(*dictionary) : "none";
}

}  // namespace quorl::test
