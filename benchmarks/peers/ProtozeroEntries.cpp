// Payloads as entries, read by tables of the fields.

#include <cstdlib>
#include <protozero/pbf_reader.hpp>

#include "peers/FieldTables.h"
#include "peers/PlainEntries.h"

namespace qel::bench {
namespace {

PlainEntries entriesOf(protozero::pbf_reader reader, const Fields& fields);

PlainValue nameOf(const Field& field, std::int32_t value) {
  const auto number = static_cast<std::size_t>(value);
  if (value >= 0 && number < field.names.size() && !field.names[number].empty()) {
    return {field.names[number]};
  }
  return {"(unknown: " + std::to_string(value) + ")"};
}

PlainValue valueOf(protozero::pbf_reader& reader, const Field& field) {
  using Descriptor = google::protobuf::FieldDescriptor;
  switch (field.type) {
    case Descriptor::TYPE_UINT32:
      return {std::uint64_t{reader.get_uint32()}};
    case Descriptor::TYPE_UINT64:
      return {std::uint64_t{reader.get_uint64()}};
    case Descriptor::TYPE_SINT32:
      return {std::int64_t{reader.get_sint32()}};
    case Descriptor::TYPE_BOOL:
      return {reader.get_bool()};
    case Descriptor::TYPE_ENUM:
      return nameOf(field, reader.get_enum());
    case Descriptor::TYPE_STRING:
      return {reader.get_string()};
    case Descriptor::TYPE_BYTES: {
      const auto view = reader.get_view();
      return {Bytes(view.data(), view.data() + view.size())};
    }
    case Descriptor::TYPE_MESSAGE:
      return {entriesOf(reader.get_message(), *field.nested)};
    default:
      std::abort();  // no metric message has such a field
  }
}

void addPacked(protozero::pbf_reader& reader, const Field& field, PlainList& list) {
  if (field.type == google::protobuf::FieldDescriptor::TYPE_SINT32) {
    for (const std::int32_t number : reader.get_packed_sint32()) {
      list.push_back({std::int64_t{number}});
    }
  } else {
    for (const std::uint32_t number : reader.get_packed_uint32()) {
      list.push_back({std::uint64_t{number}});
    }
  }
}

PlainEntries entriesOf(protozero::pbf_reader reader, const Fields& fields) {
  PlainEntries entries;
  entries.reserve(8);  // most messages have some such number of fields
  while (reader.next()) {
    const auto tag = reader.tag();
    if (tag >= fields.size() || fields[tag].key.empty()) {
      reader.skip();
      continue;
    }
    const Field& field = fields[tag];
    if (!field.repeated) {
      entries.push_back({field.key, valueOf(reader, field)});
    } else if (!field.nested && reader.has_wire_type(protozero::pbf_wire_type::length_delimited)) {
      addPacked(reader, field, listOf(entries, field.key));
    } else {
      listOf(entries, field.key).push_back(valueOf(reader, field));
    }
  }
  return entries;
}

}  // namespace

EntriesReader protozeroEntries(std::uint32_t metric) {
  const Fields& fields = fieldsOf(metric);
  return [&fields](const Bytes& bytes) {
    const auto* data = reinterpret_cast<const char*>(bytes.data());
    return entriesOf(protozero::pbf_reader(data, bytes.size()), fields);
  };
}

}  // namespace qel::bench
