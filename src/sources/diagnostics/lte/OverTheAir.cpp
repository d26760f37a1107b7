#include "sources/diagnostics/lte/OverTheAir.h"

#include <algorithm>
#include <array>

#include "sources/diagnostics/packets/Bits.h"

namespace qel::diagnostics {
namespace {

using rrc::lte::Channel;

// Where the head has what, by version.
struct HeadRow {
  std::uint8_t first;
  std::uint8_t last;
  std::uint8_t pci;
  std::uint8_t earfcn;
  std::uint8_t earfcnBytes;
  std::uint8_t kind;
  std::uint8_t length;
  std::uint8_t segment;  // 0: messages are whole
  std::uint8_t size;
};
constexpr std::array kHeads = {
    HeadRow{2, 4, 4, 6, 2, 10, 11, 0, 13},    HeadRow{5, 7, 4, 6, 2, 10, 15, 0, 17},
    HeadRow{8, 24, 4, 6, 4, 12, 17, 0, 19},   HeadRow{25, 29, 6, 8, 4, 14, 19, 0, 21},
    HeadRow{30, 31, 6, 8, 4, 14, 19, 23, 24},
};

// The numbers of the channels, in the order of Channel.
using Numbers = std::array<std::uint8_t, 8>;
constexpr Numbers kFirst = {1, 2, 3, 4, 5, 6, 7, 8};
constexpr Numbers kSecond = {8, 9, 10, 11, 12, 13, 14, 15};
constexpr Numbers kThird = {1, 2, 4, 5, 6, 7, 8, 9};
constexpr Numbers kFourth = {1, 3, 6, 7, 8, 9, 10, 11};

struct NumbersRow {
  std::uint32_t versions;  // bit N: version N
  const Numbers& numbers;
};
template <class... Version>
constexpr std::uint32_t versions(Version... version) {
  return (0U | ... | (1U << version));
}
constexpr std::array kNumbers = {
    NumbersRow{versions(2, 3, 4, 5, 6, 7, 8, 13, 22), kFirst},
    NumbersRow{versions(9, 12), kSecond},
    NumbersRow{versions(14, 15, 16, 20, 24, 25), kThird},
    NumbersRow{versions(19, 26, 27, 29, 30, 31), kFourth},
};

}  // namespace

OverTheAir overTheAir(ByteView body) {
  OverTheAir packet;
  if (body.empty()) return packet;
  const std::uint8_t version = body[0];
  const auto head = std::ranges::find_if(
      kHeads, [&](const HeadRow& row) { return row.first <= version && version <= row.last; });
  const auto row = std::ranges::find_if(kNumbers, [&](const NumbersRow& candidate) {
    return version < 32 && (candidate.versions >> version & 1U) != 0;
  });
  if (head == kHeads.end() || row == kNumbers.end()) {
    packet.outcome = Outcome::unknownVersion;
    return packet;
  }
  if (body.size() < head->size || u16At(body, head->length) != body.size() - head->size) {
    return packet;
  }
  packet.outcome = Outcome::notOurs;
  const auto number = std::ranges::find(row->numbers, body[head->kind]);
  const bool isPart = head->segment != 0 && body[head->segment] != 0;
  if (number == row->numbers.end() || isPart) return packet;
  packet.outcome = Outcome::understood;
  packet.cell.pci = u16At(body, head->pci);
  packet.cell.earfcn =
      head->earfcnBytes == 2 ? u16At(body, head->earfcn) : u32At(body, head->earfcn);
  packet.channel = static_cast<Channel>(number - row->numbers.begin());
  packet.message = body.subspan(head->size);
  return packet;
}

}  // namespace qel::diagnostics
