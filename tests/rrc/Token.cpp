#include "rrc/Token.h"

#include <ostream>

#include "rrc/reader/BitReader.h"

namespace qel::testing {

using namespace rrc;
using rrc::generator::Tables;

namespace {

constexpr unsigned kLongestNumber = 64;

std::string nameOf(const Tables& tables, Mark mark) {
  if (mark < Mark::first) return {};
  return tables.fieldNames[static_cast<std::size_t>(mark) - static_cast<std::size_t>(Mark::first)];
}

Bytes leftAligned(ByteView message, const Found& found) {
  BitReader reader(message);
  reader.skip(found.bit);
  Bytes bytes;
  for (std::uint32_t left = found.bits; left > 0;) {
    const std::uint32_t count = left < 8 ? left : 8;
    bytes.push_back(static_cast<std::uint8_t>(reader.bits(count) << (8 - count)));
    left -= count;
  }
  return bytes;
}

}  // namespace

std::ostream& operator<<(std::ostream& stream, const Token& token) {
  return stream << token.name << " = " << token.number << ' ' << token.hex << ' ' << token.chosen;
}

Token tokenOf(const Tables& tables, const Type& type, std::string name, std::int64_t value,
              const Bytes& leftAligned) {
  Token token{std::move(name), {}, {}, {}};
  if (type.kind != Kind::octets) token.number = std::to_string(value);
  if (type.kind == Kind::octets || type.kind == Kind::bits) token.hex = hexText(leftAligned);
  if (type.kind == Kind::choice && value < type.count + type.additions) {
    token.chosen = tables.fieldNames[type.first + static_cast<std::size_t>(value)];
  }
  return token;
}

std::vector<Token> tokensOf(const Reading& reading, const Tables& tables) {
  std::vector<Token> tokens;
  for (const Found& found : reading.found) {
    const Type& type = reading.schema()[found.type];
    const bool hasValue =
        type.kind != Kind::null && type.kind != Kind::sequence && type.kind != Kind::stop;
    if (!hasValue) continue;
    const std::int64_t value =
        type.kind == Kind::bits && found.bits > kLongestNumber ? 0 : found.value;
    tokens.push_back(tokenOf(tables, type, nameOf(tables, found.mark), value,
                             leftAligned(reading.message(), found)));
  }
  return tokens;
}

}  // namespace qel::testing
