#include "rrc/reader/Walker.h"

#include "rrc/reader/BitReader.h"

namespace qel::rrc {
namespace {

enum class Step { on, stopped, damaged };

class Walker {
 public:
  Walker(const Schema& schema, std::vector<Found>& found) : _schema(schema), _found(found) {}

  Step read(BitReader& bits, TypeIndex index, Mark mark, unsigned depth);

 private:
  Step content(BitReader& bits, const Type& type, Found& found, unsigned depth);
  void scalar(BitReader& bits, const Type& type, Found& found);
  Step string(BitReader& bits, const Type& type, Found& found, unsigned depth);
  Step list(BitReader& bits, const Type& type, Found& found, unsigned depth);
  Step sequence(BitReader& bits, const Type& type, unsigned depth);
  Step choice(BitReader& bits, const Type& type, Found& found, unsigned depth);
  Step additions(BitReader& bits, const Type& type, unsigned depth);
  Step addition(BitReader& bits, const Field* field, unsigned depth);

  const Field& field(const Type& type, std::size_t index) const {
    return _schema.fields[type.first + index];
  }

  const Schema& _schema;
  std::vector<Found>& _found;
  std::size_t _fields = 0;
};

Step Walker::read(BitReader& bits, TypeIndex index, Mark mark, unsigned depth) {
  if (depth >= kDeepest || ++_fields > kMostFields) return Step::damaged;
  const std::size_t place = _found.size();
  Found found{.mark = mark, .type = index};
  if (mark != Mark::none) _found.push_back(found);
  const Step step = content(bits, _schema[index], found, depth);
  if (mark != Mark::none) {
    found.end = static_cast<std::uint32_t>(_found.size());
    _found[place] = found;
  }
  return bits.failed() ? Step::damaged : step;
}

Step Walker::content(BitReader& bits, const Type& type, Found& found, unsigned depth) {
  switch (type.kind) {
    case Kind::bits:
    case Kind::octets:
      return string(bits, type, found, depth);
    case Kind::list:
      return list(bits, type, found, depth);
    case Kind::sequence:
      return sequence(bits, type, depth);
    case Kind::choice:
      return choice(bits, type, found, depth);
    case Kind::stop:
      return Step::stopped;
    default:
      scalar(bits, type, found);
      return Step::on;
  }
}

void Walker::scalar(BitReader& bits, const Type& type, Found& found) {
  if (type.kind == Kind::boolean) {
    found.value = bits.flag() ? 1 : 0;
  } else if (type.kind == Kind::integer) {
    found.value = bits.integer(type.low, type.high);
  } else if (type.kind == Kind::enumerated) {
    const bool newer = type.extensible && bits.flag();
    found.value = newer ? type.high + 1 + static_cast<std::int64_t>(bits.smallNumber() & 0xFFFF)
                        : bits.integer(type.low, type.high);
  }
}

Step Walker::string(BitReader& bits, const Type& type, Found& found, unsigned depth) {
  const std::size_t size =
      type.unbounded ? bits.length() : static_cast<std::size_t>(bits.integer(type.low, type.high));
  BitReader inside = bits.part(type.kind == Kind::octets ? size * 8 : size);
  if (inside.failed()) return Step::damaged;
  found.bit = static_cast<std::uint32_t>(inside.position());
  found.bits = static_cast<std::uint32_t>(inside.left());
  if (type.content != TypeIndex::none) {
    const Step step = read(inside, type.content, Mark::none, depth + 1);
    return step == Step::damaged ? step : Step::on;
  }
  if (found.bits <= 64) found.value = static_cast<std::int64_t>(inside.bits(found.bits));
  return Step::on;
}

Step Walker::list(BitReader& bits, const Type& type, Found& found, unsigned depth) {
  const Mark mark = found.mark == Mark::none ? Mark::none : Mark::element;
  found.value = bits.integer(type.low, type.high);
  for (std::int64_t i = 0; i < found.value && !bits.failed(); ++i) {
    const Step step = read(bits, type.content, mark, depth + 1);
    if (step != Step::on) return step;
  }
  return Step::on;
}

Step Walker::sequence(BitReader& bits, const Type& type, unsigned depth) {
  const bool extended = type.extensible && bits.flag();
  std::size_t optional = 0;
  for (std::size_t i = 0; i < type.count; ++i) optional += field(type, i).optional ? 1U : 0U;
  BitReader present = bits.part(optional);
  for (std::size_t i = 0; i < type.count; ++i) {
    const Field& next = field(type, i);
    if (next.optional && !present.flag()) continue;
    const Step step = read(bits, next.type, next.mark, depth + 1);
    if (step != Step::on) return step;
  }
  return extended ? additions(bits, type, depth) : Step::on;
}

Step Walker::choice(BitReader& bits, const Type& type, Found& found, unsigned depth) {
  if (type.extensible && bits.flag()) {
    const std::uint64_t index = bits.smallNumber();
    found.value = type.count + static_cast<std::int64_t>(index & 0xFFFF);
    const bool known = index < type.additions;
    return addition(
        bits, known ? &field(type, type.count + static_cast<std::size_t>(index)) : nullptr, depth);
  }
  found.value = bits.integer(0, type.count - 1);
  if (bits.failed()) return Step::damaged;
  const Field& chosen = field(type, static_cast<std::size_t>(found.value));
  return read(bits, chosen.type, chosen.mark, depth + 1);
}

Step Walker::additions(BitReader& bits, const Type& type, unsigned depth) {
  const std::size_t count = bits.smallLength();
  BitReader present = bits.part(count);
  for (std::size_t i = 0; i < count && !bits.failed(); ++i) {
    if (!present.flag()) continue;
    const bool known = i < type.additions;
    const Step step = addition(bits, known ? &field(type, type.count + i) : nullptr, depth);
    if (step != Step::on) return step;
  }
  return Step::on;
}

// Whatever its content is, an addition ends where its length says.
Step Walker::addition(BitReader& bits, const Field* field, unsigned depth) {
  BitReader inside = bits.part(bits.length() * 8);
  if (inside.failed()) return Step::damaged;
  if (field == nullptr || field->type == TypeIndex::none) return Step::on;
  const Step step = read(inside, field->type, field->mark, depth + 1);
  return step == Step::damaged ? step : Step::on;
}

}  // namespace

std::optional<Reading> walk(const Schema& schema, TypeIndex type, ByteView message) {
  if (message.size() > kLongestMessage) return std::nullopt;
  Reading reading(schema, message);
  BitReader bits(message);
  reading.found.push_back({.type = type});
  const Step step = Walker(schema, reading.found).read(bits, type, Mark::none, 0);
  if (step == Step::damaged) return std::nullopt;
  reading.found.front().end = static_cast<std::uint32_t>(reading.found.size());
  return reading;
}

}  // namespace qel::rrc
