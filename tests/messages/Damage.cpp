#include "Damage.h"

#include "Wire.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel::testing {
namespace {

// A field that no message has, of any wire type, at times with a number of more than 16 bits.
Bytes unknownField(RandomMessages& random) {
  const std::uint64_t number = 40 + random.upTo(20) + (random.upTo(3) == 0 ? 0x10000 : 0);
  switch (random.upTo(7)) {
    case 0:
      return joined(tag(number, WireType::varint), varint(random.varintValue()));
    case 1:
      return joined(tag(number, WireType::fixed64), Bytes(8, 0xFF));
    case 2:
      return delimitedField(number, random.bytes(10));
    case 3:
      return joined(tag(number, WireType::fixed32), Bytes(4, 0xFF));
    case 4:
      return tag(number, WireType::groupEnd);
    case 5:
      return tag(number, static_cast<WireType>(6 + random.upTo(1)));
    default: {
      const std::uint64_t end = random.upTo(5) == 0 ? number + 1 : number;
      const Bytes content = random.upTo(1) == 0 ? Bytes() : unknownField(random);
      return joined(tag(number, WireType::groupStart), content, tag(end, WireType::groupEnd));
    }
  }
}

Bytes metricIdentifier(RandomMessages& random) {
  const auto metrics = KBBMetricUtility::catalogue();
  const std::uint64_t number = metrics[random.upTo(metrics.size() - 1)].identifier;
  const auto type = static_cast<WireType>(random.upTo(7));
  return joined(tag(number, type), varint(random.varintValue()));
}

Bytes knownFieldOfAnyType(RandomMessages& random) {
  return joined(tag(1 + random.upTo(24), static_cast<WireType>(random.upTo(7))),
                varint(random.upTo(1) == 0 ? random.upTo(6) : random.varintValue()));
}

Bytes somethingToPutIn(RandomMessages& random) {
  switch (random.upTo(4)) {
    case 0:
      return unknownField(random);
    case 1:
      return metricIdentifier(random);
    case 2:
      return Bytes(9 + random.upTo(4), 0xFF);
    case 3:
      return knownFieldOfAnyType(random);
    default:
      return random.bytes(6);
  }
}

void damage(RandomMessages& random, Bytes& bytes) {
  const std::size_t position = random.upTo(bytes.size());
  const auto place = bytes.begin() + static_cast<std::ptrdiff_t>(position);
  switch (random.upTo(4)) {
    case 0:
      bytes.resize(position);
      break;
    case 1:
      if (place != bytes.end()) *place ^= static_cast<std::uint8_t>(1U << random.upTo(7));
      break;
    case 2:
      if (place != bytes.end()) *place = static_cast<std::uint8_t>(random.upTo(255));
      break;
    default: {
      const Bytes part = somethingToPutIn(random);
      bytes.insert(random.upTo(2) == 0 ? bytes.end() : place, part.begin(), part.end());
    }
  }
}

}  // namespace

Bytes damaged(RandomMessages& random, Bytes bytes) {
  for (std::uint64_t i = 1 + random.upTo(2); i > 0; --i) damage(random, bytes);
  return bytes;
}

}  // namespace qel::testing
