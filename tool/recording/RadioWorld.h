#pragma once

#include <array>
#include <cstdint>
#include <initializer_list>
#include <iterator>
#include <random>

#include "base/SharedBytes.h"

namespace quorl::tool {

struct LteCell {
  std::uint32_t pci;
  std::uint32_t dlEarfcn;
  std::uint32_t ulEarfcn;
  std::uint32_t band;
  std::uint32_t resourceBlocks;
  std::uint32_t cellId;
  std::uint32_t tac;
};

struct NrCell {
  std::uint32_t pci;
  std::uint32_t arfcn;
  std::uint32_t band;
  std::uint32_t bandwidthMHz;
  std::uint32_t cellId;
  std::uint32_t tac;
};

struct UmtsCell {
  std::uint32_t psc;
  std::uint32_t uarfcn;
  std::uint32_t cellId;
  std::uint32_t lac;
};

struct GsmCell {
  std::uint32_t bsic;
  std::uint32_t arfcn;
  std::uint32_t cellId;
  std::uint32_t lac;
};

/// An invented radio network and a device with two subscriptions that is driven through it. Nothing of it exists: the
/// networks are those of test country 001.
///
/// What happens is the same for the same seed on every machine.
class RadioWorld {
 public:
  explicit RadioWorld(std::uint64_t seed) : random_(seed) {}

  /// Goes on to a moment, and looks at the device's subscription 0 or 1.
  void goTo(std::uint32_t atMs, std::uint32_t subsId);

  std::uint64_t timestampMs() const { return kStartMs + atMs_; }
  std::uint32_t subsId() const { return subsId_; }
  std::uint32_t mcc() const { return 1; }
  std::uint32_t mnc() const { return subsId_ + 1; }
  std::uint32_t mncDigits() const { return 2; }
  /// The network as three bytes of packed digits.
  ByteString plmn() const;

  /// The serving cell, or the one that comes `ahead` cells later on the road.
  const LteCell& lte(std::size_t ahead = 0) const;
  const NrCell& nr(std::size_t ahead = 0) const;
  const UmtsCell& umts(std::size_t ahead = 0) const;
  const GsmCell& gsm(std::size_t ahead = 0) const;

  /// Level of the serving cell in dBm: it falls toward the border of each cell, and never stands still.
  std::int32_t lteRsrp();
  std::int32_t nrRsrp();
  std::int32_t umtsRscp();
  /// Quality in dB that goes with a level.
  std::int32_t rsrqAt(std::int32_t rsrp);
  std::int32_t sinrAt(std::int32_t rsrp);

  /// Both limits included.
  std::int32_t number(std::int32_t least, std::int32_t most);
  std::uint32_t count(std::uint32_t least, std::uint32_t most);
  bool chance(std::uint32_t percent) { return count(1, 100) <= percent; }
  ByteString bytes(std::size_t length);
  template <typename T>
  T oneOf(std::initializer_list<T> values) {
    return *std::next(values.begin(),
                      static_cast<std::ptrdiff_t>(count(0, static_cast<std::uint32_t>(values.size()) - 1)));
  }

 private:
  static constexpr std::uint64_t kStartMs = 1767605400000;  // 2026-01-05 09:30:00 UTC

  /// How far the device is from the serving cell's centre, in percent.
  std::int32_t distance() const;
  std::size_t place() const;

  std::mt19937_64 random_;
  std::uint32_t atMs_ = 0;
  std::uint32_t subsId_ = 0;
};

}  // namespace quorl::tool
