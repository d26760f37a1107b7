#include "rrc/RandomRrc.h"

#include <algorithm>

namespace qel::testing {

using namespace rrc;
using rrc::Kind;

namespace {

constexpr std::size_t kPadding = 8;  // bytes behind what is read, where more may stand

}  // namespace

RandomRrcMessage RandomRrc::message(TypeIndex type) {
  _tokens.clear();
  BitWriter bits;
  write(bits, type, {}, 0);
  Bytes pdu = bits.bytes();
  pdu.resize(pdu.size() + kPadding);
  return {std::move(pdu), std::move(_tokens)};
}

std::int64_t RandomRrc::between(std::int64_t low, std::int64_t high) {
  if (chance(10)) return low;
  if (chance(10)) return high;
  return low + static_cast<std::int64_t>(upTo(static_cast<std::uint64_t>(high - low)));
}

Bytes RandomRrc::randomBytes(std::size_t size) {
  Bytes bytes(size);
  for (auto& byte : bytes) byte = static_cast<std::uint8_t>(upTo(0xFF));
  return bytes;
}

bool RandomRrc::mayChoose(const Type& type, std::size_t index) const {
  const TypeIndex of = field(type, index).type;
  if (of == TypeIndex::none || _choice.never.contains(nameOf(type, index))) return false;
  const Type& inside = _tables.types[static_cast<std::size_t>(of)];
  if (inside.kind != Kind::choice) return inside.kind != Kind::stop;
  for (std::size_t i = 0; i < std::size_t{inside.count} + inside.additions; ++i) {
    if (mayChoose(inside, i)) return true;
  }
  return false;
}

bool RandomRrc::wants(const Type& type, std::size_t index, int depth) {
  constexpr int kShallow = 14;
  constexpr unsigned kSeldom = 10;
  if (!mayChoose(type, index)) return false;
  unsigned& uses = _uses[type.first + index];
  const bool wanted = chance(uses < kSeldom ? 90 : depth < kShallow ? 65 : 40);
  uses += wanted ? 1 : 0;
  return wanted;
}

std::size_t RandomRrc::alternative(const Type& type) {
  std::vector<std::size_t> readable;
  const std::size_t all = std::size_t{type.count} + type.additions;
  for (std::size_t i = 0; i < all; ++i) {
    if (mayChoose(type, i)) readable.push_back(i);
  }
  if (readable.empty()) return 0;
  const auto uses = [&](std::size_t i) -> unsigned& { return _uses[type.first + i]; };
  const auto seldom = *std::min_element(readable.begin(), readable.end(),
                                        [&](auto a, auto b) { return uses(a) < uses(b); });
  const std::size_t chosen = chance(60) ? seldom : readable[upTo(readable.size() - 1)];
  ++uses(chosen);
  return chosen;
}

void RandomRrc::write(BitWriter& bits, TypeIndex index, const std::string& name, int depth) {
  const Type& type = _tables.types[static_cast<std::size_t>(index)];
  switch (type.kind) {
    case Kind::null:
    case Kind::stop:
      return;
    case Kind::bits:
    case Kind::octets:
      return string(bits, type, name, depth);
    case Kind::list:
      return list(bits, type, name, depth);
    case Kind::sequence:
      return sequence(bits, type, depth);
    case Kind::choice:
      return choice(bits, type, name, depth);
    default:
      return scalar(bits, type, name);
  }
}

void RandomRrc::scalar(BitWriter& bits, const Type& type, const std::string& name) {
  std::int64_t value = 0;
  if (type.kind == Kind::boolean) {
    value = between(0, 1);
    bits.flag(value == 1);
  } else {
    value = between(type.low, type.high);
    if (type.extensible) bits.flag(false);
    bits.number(value, type.low, type.high);
  }
  _tokens.push_back(tokenOf(_tables, type, name, value, {}));
}

void RandomRrc::string(BitWriter& bits, const Type& type, const std::string& name, int depth) {
  constexpr std::size_t kLongest = 40;
  if (type.content != TypeIndex::none) {
    const std::size_t place = _tokens.size();
    _tokens.emplace_back();
    BitWriter inside;
    write(inside, type.content, {}, depth + 1);
    bits.contained(inside);
    _tokens[place] = tokenOf(_tables, type, name, 0, inside.bytes());
    return;
  }
  const auto size = static_cast<std::size_t>(type.unbounded ? between(1, kLongest)
                                                            : between(type.low, type.high));
  if (type.unbounded) {
    bits.length(size);
  } else {
    bits.number(static_cast<std::int64_t>(size), type.low, type.high);
  }
  BitWriter content;
  const bool late = name == "lateNonCriticalExtension";  // not read, but no random bits either
  std::uint64_t value = 0;
  const std::size_t count = type.kind == Kind::octets ? size * 8 : size;
  for (std::size_t i = 0; i < count; ++i) {
    const bool bit = !late && upTo(1) == 1;
    value = value << 1 | (bit ? 1 : 0);
    content.flag(bit);
  }
  bits.append(content);
  const auto number = count > 64 ? 0 : static_cast<std::int64_t>(value);
  _tokens.push_back(tokenOf(_tables, type, name, number, content.bytes()));
}

void RandomRrc::list(BitWriter& bits, const Type& type, const std::string& name, int depth) {
  constexpr std::int64_t kFew = 3;
  const std::int64_t most = chance(5) ? type.high : std::min(type.high, type.low + kFew);
  const std::int64_t count = between(type.low, most);
  bits.number(count, type.low, type.high);
  _tokens.push_back(tokenOf(_tables, type, name, count, {}));
  for (std::int64_t i = 0; i < count; ++i) write(bits, type.content, {}, depth + 1);
}

void RandomRrc::sequence(BitWriter& bits, const Type& type, int depth) {
  std::vector<bool> present;
  for (std::size_t i = 0; i < type.count; ++i) {
    present.push_back(!field(type, i).optional || wants(type, i, depth));
  }
  const std::vector<bool> added = type.extensible ? chosenAdditions(type, depth) : present;
  const bool extended =
      type.extensible && std::find(added.begin(), added.end(), true) != added.end();
  if (type.extensible) bits.flag(extended);
  for (std::size_t i = 0; i < type.count; ++i) {
    if (field(type, i).optional) bits.flag(present[i]);
  }
  for (std::size_t i = 0; i < type.count; ++i) {
    if (present[i]) write(bits, field(type, i).type, nameOf(type, i), depth + 1);
  }
  if (extended) additions(bits, type, added, depth);
}

void RandomRrc::choice(BitWriter& bits, const Type& type, const std::string& name, int depth) {
  const std::size_t chosen = alternative(type);
  _tokens.push_back(tokenOf(_tables, type, name, static_cast<std::int64_t>(chosen), {}));
  if (type.extensible) bits.flag(chosen >= type.count);
  if (chosen < type.count) {
    bits.number(static_cast<std::int64_t>(chosen), 0, type.count - 1);
    return write(bits, field(type, chosen).type, nameOf(type, chosen), depth + 1);
  }
  BitWriter inside;
  write(inside, field(type, chosen).type, nameOf(type, chosen), depth + 1);
  bits.smallNumber(chosen - type.count).contained(inside);
}

std::vector<bool> RandomRrc::chosenAdditions(const Type& type, int depth) {
  constexpr std::size_t kNewer = 3;
  std::vector<bool> chosen;
  for (std::size_t i = 0; i < type.additions; ++i) {
    const std::size_t place = type.count + i;
    const bool known = field(type, place).type != TypeIndex::none;
    chosen.push_back(known ? wants(type, place, depth) : _choice.foreign && chance(50));
  }
  for (std::size_t i = _choice.foreign ? upTo(kNewer) : 0; i > 0; --i) chosen.push_back(chance(50));
  return chosen;
}

void RandomRrc::additions(BitWriter& bits, const Type& type, const std::vector<bool>& chosen,
                          int depth) {
  constexpr std::size_t kLongest = 5;
  bits.smallNumber(chosen.size() - 1);
  for (const bool there : chosen) bits.flag(there);
  for (std::size_t i = 0; i < chosen.size(); ++i) {
    if (!chosen[i]) continue;
    BitWriter inside;
    if (i < type.additions && field(type, type.count + i).type != TypeIndex::none) {
      write(inside, field(type, type.count + i).type, nameOf(type, type.count + i), depth + 1);
    } else {
      inside.octets(randomBytes(1 + upTo(kLongest)));
    }
    bits.contained(inside);
  }
}

}  // namespace qel::testing
