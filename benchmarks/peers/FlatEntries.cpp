#include "peers/FlatEntries.h"

#include <cstdlib>
#include <protozero/pbf_reader.hpp>

#include "peers/PlainCode.h"

namespace qel::bench {
namespace {

using google::protobuf::FieldDescriptor;
using Kind = FlatEntry::Kind;

class FlatReader {
 public:
  explicit FlatReader(FlatEntries& entries) : _entries(entries) {}

  void read(protozero::pbf_reader reader, const Fields& fields) {
    while (reader.next()) {
      const auto tag = reader.tag();
      if (tag >= fields.size() || fields[tag].key.empty()) {
        reader.skip();
      } else if (!fields[tag].repeated) {
        readValue(reader, fields[tag], fields[tag].key);
      } else if (fields[tag].nested) {
        readElements(reader, fields[tag]);
      } else {
        readPacked(reader, fields[tag]);
      }
    }
  }

 private:
  FlatEntry& add(std::string_view key, Kind kind) {
    FlatEntry& entry = _entries.emplace_back();
    entry.key = key;
    entry.kind = kind;
    return entry;
  }

  void readValue(protozero::pbf_reader& reader, const Field& field, std::string_view key) {
    switch (field.type) {
      case FieldDescriptor::TYPE_UINT32:
        add(key, Kind::number).number = reader.get_uint32();
        return;
      case FieldDescriptor::TYPE_UINT64:
        add(key, Kind::number).number = reader.get_uint64();
        return;
      case FieldDescriptor::TYPE_SINT32:
        return addSigned(key, reader.get_sint32());
      case FieldDescriptor::TYPE_BOOL:
        add(key, Kind::truth).number = reader.get_bool();
        return;
      case FieldDescriptor::TYPE_ENUM:
        return addName(field, key, reader.get_enum());
      case FieldDescriptor::TYPE_STRING:
        return addText(key, Kind::text, reader.get_view());
      case FieldDescriptor::TYPE_BYTES:
        return addText(key, Kind::bytes, reader.get_view());
      case FieldDescriptor::TYPE_MESSAGE:
        return addEntries(reader, field, key);
      default:
        std::abort();  // no metric message has such a field
    }
  }

  void addSigned(std::string_view key, std::int64_t value) {
    add(key, value < 0 ? Kind::negative : Kind::number).number = static_cast<std::uint64_t>(value);
  }

  void addName(const Field& field, std::string_view key, std::int32_t value) {
    const auto number = static_cast<std::size_t>(value);
    if (value < 0 || number >= field.names.size() || field.names[number].empty()) {
      return addSigned(key, value);
    }
    add(key, Kind::name).text = field.names[number];
  }

  void addText(std::string_view key, Kind kind, protozero::data_view view) {
    add(key, kind).text = {view.data(), view.size()};
  }

  void addEntries(protozero::pbf_reader& reader, const Field& field, std::string_view key) {
    const std::size_t position = _entries.size();
    add(key, Kind::entries);
    read(reader.get_message(), *field.nested);
    _entries[position].end = static_cast<std::uint32_t>(_entries.size());
  }

  // The list ends where the entries end: it is the last that was read, or it is new.
  void readElements(protozero::pbf_reader& reader, const Field& field) {
    if (_list >= _entries.size() || _entries[_list].key != field.key ||
        _entries[_list].end != _entries.size()) {
      _list = _entries.size();
      add(field.key, Kind::list);
    }
    const std::size_t list = _list;
    addEntries(reader, field, {});
    _list = list;
    _entries[list].end = static_cast<std::uint32_t>(_entries.size());
  }

  void readPacked(protozero::pbf_reader& reader, const Field& field) {
    const std::size_t list = _entries.size();
    add(field.key, Kind::list);
    if (field.type == FieldDescriptor::TYPE_SINT32) {
      for (const std::int32_t number : reader.get_packed_sint32()) addSigned({}, number);
    } else {
      for (const std::uint32_t number : reader.get_packed_uint32()) {
        add({}, Kind::number).number = number;
      }
    }
    _entries[list].end = static_cast<std::uint32_t>(_entries.size());
  }

  FlatEntries& _entries;
  std::size_t _list = ~std::size_t{0};  // the list that was read last
};

class FlatWriter {
 public:
  FlatWriter(const FlatEntries& entries, Line& out) : _entries(entries), _out(out) {}

  void write(std::size_t from, std::size_t to, std::string_view open, std::string_view close) {
    _out.append(open);
    while (from < to) {
      const FlatEntry& entry = _entries[from];
      if (!entry.key.empty()) {
        plain::quoted(_out, entry.key);
        _out.back(2);
        _out.literal(": ");
      }
      from = writeValue(entry, from + 1);
    }
    plain::close(_out, close);
  }

 private:
  // Where the next one is.
  std::size_t writeValue(const FlatEntry& entry, std::size_t next) {
    switch (entry.kind) {
      case Kind::truth:
        plain::truth(_out, entry.number != 0);
        break;
      case Kind::number:
        _out.number(entry.number);
        break;
      case Kind::negative:
        _out.number(static_cast<std::int64_t>(entry.number));
        break;
      case Kind::name:
      case Kind::text:
        plain::quoted(_out, entry.text);
        break;
      case Kind::bytes:
        plain::hexadecimal(_out, entry.text);
        break;
      case Kind::list:
        write(next, entry.end, "[", "], ");
        return entry.end;
      case Kind::entries:
        write(next, entry.end, "{", "}, ");
        return entry.end;
    }
    return next;
  }

  const FlatEntries& _entries;
  Line& _out;
};

}  // namespace

void readFlat(const Fields& fields, ByteView payload, FlatEntries& entries) {
  entries.clear();
  const auto* data = reinterpret_cast<const char*>(payload.data());
  FlatReader(entries).read({data, payload.size()}, fields);
}

std::size_t visit(const FlatEntries& entries) {
  std::size_t seen = 0;
  for (const FlatEntry& entry : entries) {
    seen += entry.key.size() + static_cast<std::size_t>(entry.kind);
  }
  return seen;
}

std::string flatText(const FlatEntries& entries) {
  Line text;
  FlatWriter(entries, text).write(0, entries.size(), "{", "}");
  return std::string(text.view());
}

}  // namespace qel::bench
