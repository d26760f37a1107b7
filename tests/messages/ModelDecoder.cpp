#include "ModelDecoder.h"

#include <cstdio>
#include <set>
#include <utility>

#include "base/FatalError.h"

namespace qel::testing {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;

const std::set<std::uint64_t> kMetrics = {19972, 19992, 20005, 16578, 54030, 54017, 54018, 20330,
                                          54540, 54027, 54035, 54032, 54031, 54537, 54541, 53522,
                                          12300, 53506, 53507, 53509, 53508, 53523, 54538, 54539,
                                          11788, 53249, 53250, 53251, 53257, 53260, 19};

// Ends the reading of everything: no message comes of it.
struct Undecodable {};

class Model {
 public:
  explicit Model(const Bytes& bytes) : _bytes(bytes), _end(bytes.size()) {}

  Dictionary message(const Descriptor& schema);
  std::vector<std::string> log;

 private:
  std::optional<std::uint64_t> varintIfWhole();
  std::uint64_t varint();
  Bytes take(std::uint64_t count);
  void skip(std::uint64_t number, std::uint64_t wireType);
  void metric(std::uint64_t number);
  Value value(const FieldDescriptor& field);
  void store(std::map<int, Value>& fields, const FieldDescriptor& field);

  // Runs `read` on the part that a length announces. Afterwards only the end is put back: what the
  // part has left unread is read as what comes next.
  template <class Read>
  void delimited(Read&& read) {
    const std::uint64_t length = varint();
    if (length > _end - _position) throw Undecodable();
    const std::size_t end = std::exchange(_end, _position + length);
    read();
    _end = end;
  }

  const Bytes& _bytes;
  std::size_t _position = 0;
  std::size_t _end;
};

// Nothing when it is cut off.
std::optional<std::uint64_t> Model::varintIfWhole() {
  std::uint64_t value = 0;
  for (unsigned i = 0; i < 10; ++i) {
    if (_position == _end) return std::nullopt;
    const std::uint64_t byte = _bytes[_position++];
    value += (byte % 128) << (7 * i);
    if (byte < 128) return value;
  }
  return 0;
}

// A varint that is cut off spoils everything, so there is no error flag to carry along.
std::uint64_t Model::varint() {
  const auto value = varintIfWhole();
  if (!value) throw Undecodable();
  return *value;
}

Bytes Model::take(std::uint64_t count) {
  if (count > _end - _position) throw Undecodable();
  const auto begin = _bytes.begin() + static_cast<std::ptrdiff_t>(_position);
  _position += count;
  return {begin, begin + static_cast<std::ptrdiff_t>(count)};
}

void Model::skip(std::uint64_t number, std::uint64_t wireType) {
  switch (wireType) {
    case 0:
      varint();
      return;
    case 1:
      take(8);
      return;
    case 2:
      take(varint());
      return;
    case 5:
      take(4);
      return;
    case 3:
      break;
    default:
      throw Undecodable();
  }
  while (true) {
    const std::uint64_t tag = varint();
    const std::uint64_t inner = tag / 8 % 65536;
    if (tag % 8 != 4) {
      skip(inner, tag % 8);
    } else if (inner == number) {
      return;
    } else {
      throw Undecodable();
    }
  }
}

void Model::metric(std::uint64_t number) {
  const auto value = varintIfWhole();
  char line[64];
  std::snprintf(line, sizeof line, "Unknown tag: %x:%u", static_cast<unsigned>(number),
                static_cast<unsigned>(value.value_or(0)));
  log.emplace_back("valid metricId tag");
  log.emplace_back(line);
  if (!value) throw Undecodable();
}

Value Model::value(const FieldDescriptor& field) {
  switch (field.type()) {
    case FieldDescriptor::TYPE_UINT64:
      return varint();
    case FieldDescriptor::TYPE_UINT32:
      return static_cast<std::uint32_t>(varint());
    case FieldDescriptor::TYPE_BOOL:
      return varint() != 0;
    case FieldDescriptor::TYPE_SINT32: {
      const auto folded = static_cast<std::uint32_t>(varint());
      const std::int64_t half = folded / 2;
      return folded % 2 == 0 ? half : -half - 1;
    }
    case FieldDescriptor::TYPE_ENUM: {
      const auto number = static_cast<std::int32_t>(varint());
      const auto* named = field.enum_type()->FindValueByNumber(number);
      return named ? named->name() : "(unknown: " + std::to_string(number) + ")";
    }
    case FieldDescriptor::TYPE_BYTES:
      return take(varint());
    case FieldDescriptor::TYPE_STRING: {
      const Bytes text = take(varint());
      return std::string(text.begin(), text.end());
    }
    case FieldDescriptor::TYPE_MESSAGE: {
      Dictionary nested;
      delimited([&] { nested = message(*field.message_type()); });
      return nested;
    }
    default:
      fatalError("a type that no schema uses: " + field.full_name());
  }
}

void Model::store(std::map<int, Value>& fields, const FieldDescriptor& field) {
  if (!field.is_repeated()) {
    fields[field.number()] = value(field);
    return;
  }
  const Value& before = fields[field.number()];
  List list = before.asList() ? *before.asList() : List();
  if (field.is_packed()) {
    delimited([&] {
      while (_position < _end) list.push_back(value(field));
    });
  } else {
    list.push_back(value(field));
  }
  fields[field.number()] = list;
}

Dictionary Model::message(const Descriptor& schema) {
  std::map<int, Value> fields;
  while (_position < _end) {
    const std::uint64_t tag = varint();
    if (tag % 8 == 4) break;
    const std::uint64_t number = tag / 8 % 65536;
    const FieldDescriptor* field = schema.FindFieldByNumber(static_cast<int>(number));
    if (kMetrics.contains(number)) {
      metric(number);
    } else if (field) {
      store(fields, *field);
    } else {
      skip(number, tag % 8);
    }
  }
  Dictionary dictionary;
  for (int i = 0; i < schema.field_count(); ++i) {
    const FieldDescriptor& field = *schema.field(i);
    if (fields.contains(field.number())) {
      dictionary.append(field.name(), fields[field.number()]);
    } else if (field.is_packed()) {
      dictionary.append(field.name(), List());
    }
  }
  return dictionary;
}

}  // namespace

ModelResult modelDecode(const Descriptor& schema, const Bytes& bytes) {
  Model model(bytes);
  ModelResult result;
  try {
    result.dictionary = model.message(schema);
  } catch (const Undecodable&) {
    result.dictionary = std::nullopt;
  }
  result.log = model.log;
  return result;
}

}  // namespace qel::testing
