#include "hosts/simulator/metrics/HostilePayloads.h"

#include <random>
#include <string>

#include "messages/wire/WireWriter.h"

namespace quorl::simulator::metrics {
namespace {

// Keys on the wire: field 2000, which no class has.
constexpr char kUnknownBytesKey[] = "\x82\x7D";
constexpr char kGroupKey[] = "\x83\x7D";
constexpr char kNoWireTypeKey[] = "\x87\x7D";
constexpr char kLengthOfTooMuch[] = "\xFF\xFF\xFF\xFF\x0F";

enum class Damage { CutOff, TurnedBits, NoWireType, LengthOverTheEnd, EndlessGroup, Noise };
constexpr std::uint32_t kDamages = 6;

std::size_t place(std::mt19937_64& random, std::size_t size) {
  return size == 0 ? 0 : static_cast<std::size_t>(random() % size);
}

}  // namespace

ByteString damaged(const ByteString& payload, std::uint64_t salt, std::uint32_t number) {
  constexpr std::size_t kNoiseSize = 64;
  std::mt19937_64 random(salt + number);
  std::string octets(payload.view());
  switch (static_cast<Damage>(number % kDamages)) {
    case Damage::CutOff:
      octets.resize(place(random, octets.size()));
      octets.push_back(kUnknownBytesKey[0]);  // a number that goes on where nothing comes any more
      break;
    case Damage::TurnedBits:
      for (int turn = 0; turn < 4 && !octets.empty(); ++turn) {
        char& octet = octets[place(random, octets.size())];
        octet = static_cast<char>(octet ^ static_cast<char>(1U << (random() % 8)));
      }
      break;
    case Damage::NoWireType:
      octets.insert(0, kNoWireTypeKey);
      break;
    case Damage::LengthOverTheEnd:
      octets.append(kUnknownBytesKey).append(kLengthOfTooMuch);
      break;
    case Damage::EndlessGroup:
      for (int depth = 0; depth < 200; ++depth) octets += kGroupKey;
      break;
    case Damage::Noise:
      octets.clear();
      for (std::size_t i = 0; i < kNoiseSize; ++i) octets.push_back(static_cast<char>(random() & 0xFFU));
      break;
  }
  return ByteString(octets);
}

ByteString inflated(const ByteString& payload, std::size_t bytes) {
  WireWriter length;
  length.writeUInt64(bytes, WireWriter::kNoKey);
  std::string octets(payload.view());
  octets.reserve(octets.size() + bytes + 8);
  octets.append(kUnknownBytesKey).append(length.bytes()).append(bytes, 'x');
  return ByteString(octets);
}

}  // namespace quorl::simulator::metrics
