#include "OtherSenders.h"

#include <functional>
#include <utility>
#include <vector>

#include "Wire.h"
#include "messages/runtime/PBDataReader.h"

namespace qel::testing {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;

// A message as its fields, each with its tag.
using Fields = std::vector<Bytes>;
using Change = std::function<void(Fields&)>;

Bytes rewritten(const Descriptor& schema, const Bytes& bytes, const Change& change);

// The value behind the tag, with what is within it changed.
Bytes rewrittenValue(const FieldDescriptor* field, PBDataReader& reader, std::uint64_t key,
                     const Change& change) {
  if (field && field->type() == FieldDescriptor::TYPE_MESSAGE) {
    const Bytes within = PBReaderReadData(reader).value();
    const Bytes changed = rewritten(*field->message_type(), within, change);
    return joined(varint(changed.size()), changed);
  }
  const ByteView before = reader.left();
  PBReaderSkipValueWithTag(reader, static_cast<std::uint32_t>(key >> 3),
                           static_cast<std::uint8_t>(key & 7));
  const ByteView value = before.first(before.size() - reader.left().size());
  return {value.begin(), value.end()};
}

Bytes rewritten(const Descriptor& schema, const Bytes& bytes, const Change& change) {
  Fields fields;
  PBDataReader reader(bytes);
  while (!reader.left().empty()) {
    const std::uint64_t key = PBReaderReadVarint(reader);
    const auto* field = schema.FindFieldByNumber(static_cast<int>(key >> 3));
    fields.push_back(joined(varint(key), rewrittenValue(field, reader, key, change)));
  }
  change(fields);
  Bytes all;
  for (const Bytes& field : fields) append(all, field);
  return all;
}

void shuffle(RandomMessages& random, Fields& fields) {
  for (std::size_t i = fields.size(); i > 1; --i) {
    std::swap(fields[i - 1], fields[random.upTo(i - 1)]);
  }
}

Bytes laterField(RandomMessages& random) {
  const std::uint64_t number = 100 + random.upTo(1000);
  switch (random.upTo(3)) {
    case 0:
      return varintField(number, random.varintValue());
    case 1:
      return joined(tag(number, WireType::fixed64), Bytes(8, 0xFF));
    case 2:
      return joined(tag(number, WireType::fixed32), Bytes(4, 0xFF));
    default:
      return delimitedField(number, random.bytes(10));
  }
}

}  // namespace

Bytes shuffled(RandomMessages& random, const Descriptor& schema, const Bytes& bytes) {
  return rewritten(schema, bytes, [&random](Fields& fields) { shuffle(random, fields); });
}

Bytes doubled(RandomMessages& random, const Descriptor& schema, const Bytes& bytes) {
  return rewritten(schema, bytes, [&random](Fields& fields) {
    const Fields once = fields;
    fields.insert(fields.end(), once.begin(), once.end());
    shuffle(random, fields);
  });
}

Bytes fromTheFuture(RandomMessages& random, const Descriptor& schema, const Bytes& bytes) {
  return rewritten(schema, bytes, [&random](Fields& fields) {
    for (std::uint64_t i = 1 + random.upTo(2); i > 0; --i) fields.push_back(laterField(random));
  });
}

}  // namespace qel::testing
