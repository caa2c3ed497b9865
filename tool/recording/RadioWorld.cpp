#include "recording/RadioWorld.h"

#include <cstdlib>
#include <string>

namespace quorl::tool {
namespace {

constexpr std::uint32_t kCellPassageMs = 45000;

constexpr std::array<LteCell, 7> kLteCells{{{101, 1575, 19575, 3, 100, 0x1A2D01, 4711},
                                            {102, 1575, 19575, 3, 100, 0x1A2D02, 4711},
                                            {245, 3050, 21050, 7, 75, 0x1A2E01, 4711},
                                            {246, 3050, 21050, 7, 75, 0x1A2E02, 4712},
                                            {33, 6300, 24300, 20, 50, 0x1A3101, 4712},
                                            {310, 300, 18300, 1, 100, 0x1A3302, 4712},
                                            {471, 1300, 19300, 3, 50, 0x1A3303, 4713}}};
constexpr std::array<NrCell, 5> kNrCells{{{501, 636666, 78, 100, 0x5B0101, 4711},
                                          {502, 636666, 78, 100, 0x5B0102, 4711},
                                          {77, 648672, 78, 80, 0x5B0201, 4712},
                                          {640, 428000, 1, 20, 0x5B0301, 4712},
                                          {641, 428000, 1, 20, 0x5B0302, 4713}}};
constexpr std::array<UmtsCell, 4> kUmtsCells{{{212, 10588, 0x70101, 2101},
                                              {213, 10588, 0x70102, 2101},
                                              {87, 10613, 0x70201, 2102},
                                              {399, 10638, 0x70301, 2102}}};
constexpr std::array<GsmCell, 4> kGsmCells{
    {{42, 62, 3101, 2101}, {17, 75, 3102, 2101}, {55, 88, 3103, 2102}, {9, 104, 3104, 2102}}};

}  // namespace

void RadioWorld::goTo(std::uint32_t atMs, std::uint32_t subsId) {
  atMs_ = atMs;
  subsId_ = subsId;
}

ByteString RadioWorld::plmn() const {
  return ByteString(subsId_ == 0 ? std::string_view("\x00\xF1\x10", 3) : std::string_view("\x00\xF1\x20", 3));
}

// The two subscriptions are served by different networks, and so by cells of different places in the lists.
std::size_t RadioWorld::place() const {
  return atMs_ / kCellPassageMs + subsId_ * 2;
}

const LteCell& RadioWorld::lte(std::size_t ahead) const {
  return kLteCells[(place() + ahead) % kLteCells.size()];
}

const NrCell& RadioWorld::nr(std::size_t ahead) const {
  return kNrCells[(place() + ahead) % kNrCells.size()];
}

const UmtsCell& RadioWorld::umts(std::size_t ahead) const {
  return kUmtsCells[(place() + ahead) % kUmtsCells.size()];
}

const GsmCell& RadioWorld::gsm(std::size_t ahead) const {
  return kGsmCells[(place() + ahead) % kGsmCells.size()];
}

std::int32_t RadioWorld::distance() const {
  const auto within = static_cast<std::int32_t>(atMs_ % kCellPassageMs);
  constexpr auto kHalf = static_cast<std::int32_t>(kCellPassageMs / 2);
  return std::abs(within - kHalf) * 100 / kHalf;
}

std::int32_t RadioWorld::lteRsrp() {
  return -78 - distance() * 32 / 100 + number(-3, 3);
}

std::int32_t RadioWorld::nrRsrp() {
  return -82 - distance() * 30 / 100 + number(-4, 4);
}

std::int32_t RadioWorld::umtsRscp() {
  return -72 - distance() * 30 / 100 + number(-3, 3);
}

std::int32_t RadioWorld::rsrqAt(std::int32_t rsrp) {
  return -8 + (rsrp + 78) / 4 + number(-1, 1);
}

std::int32_t RadioWorld::sinrAt(std::int32_t rsrp) {
  return 22 + (rsrp + 78) * 2 / 3 + number(-2, 2);
}

// The standard's distributions differ from library to library; its engines do not.
std::uint32_t RadioWorld::count(std::uint32_t least, std::uint32_t most) {
  return least + static_cast<std::uint32_t>(random_() % (std::uint64_t{most} - least + 1));
}

std::int32_t RadioWorld::number(std::int32_t least, std::int32_t most) {
  return least + static_cast<std::int32_t>(count(0, static_cast<std::uint32_t>(most - least)));
}

ByteString RadioWorld::bytes(std::size_t length) {
  std::string content(length, '\0');
  for (char& byte : content) byte = static_cast<char>(count(0, 255));
  return ByteString(content);
}

}  // namespace quorl::tool
