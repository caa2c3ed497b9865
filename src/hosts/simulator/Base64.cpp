#include "hosts/simulator/Base64.h"

#include <cstddef>

#include <boost/archive/iterators/base64_from_binary.hpp>
#include <boost/archive/iterators/binary_from_base64.hpp>
#include <boost/archive/iterators/dataflow_exception.hpp>
#include <boost/archive/iterators/transform_width.hpp>

namespace quorl::simulator {

namespace iterators = boost::archive::iterators;

std::string base64Text(std::string_view bytes) {
  using Encoder = iterators::base64_from_binary<iterators::transform_width<const char*, 6, 8>>;
  std::string text(Encoder(bytes.data()), Encoder(bytes.data() + bytes.size()));
  text.append((4 - text.size() % 4) % 4, '=');
  return text;
}

std::optional<std::string> base64Bytes(std::string_view text) {
  using Decoder = iterators::transform_width<iterators::binary_from_base64<const char*>, 8, 6>;
  if (text.size() % 4 != 0) return std::nullopt;
  const std::size_t end = text.size() < 2 ? 0 : text.find_last_not_of('=') + 1;
  if (text.size() - end > 2) return std::nullopt;
  const std::string_view digits = text.substr(0, end);

  std::string bytes(digits.size() * 6 / 8, '\0');
  try {
    Decoder decoder(digits.data());
    for (char& byte : bytes) {
      byte = static_cast<char>(*decoder);
      ++decoder;
    }
  } catch (const iterators::dataflow_exception&) {
    return std::nullopt;
  }
  // The decoder leaves the last digit's spare bits alone, and an unread last digit unchecked.
  if (base64Text(bytes) != text) return std::nullopt;
  return bytes;
}

}  // namespace quorl::simulator
