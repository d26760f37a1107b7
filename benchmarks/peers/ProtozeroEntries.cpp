// Payloads as entries, read by tables of the fields. The tables are made of libprotobuf's
// descriptors once, before anything is measured.

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <cstdlib>
#include <map>
#include <memory>
#include <protozero/pbf_reader.hpp>

#include "peers/PlainEntries.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

struct Field;
using Fields = std::vector<Field>;  // by tag; those without a key do not exist

struct Field {
  std::string_view key;
  google::protobuf::FieldDescriptor::Type type{};
  bool repeated = false;
  std::vector<std::string_view> names;  // of an enum, by value
  const Fields* nested = nullptr;       // of a message
};

const Fields& fieldsOf(const google::protobuf::Descriptor& message) {
  static std::map<const google::protobuf::Descriptor*, Fields> known;
  const auto [entry, isNew] = known.try_emplace(&message);
  Fields& fields = entry->second;
  if (!isNew) return fields;
  for (int i = 0; i < message.field_count(); ++i) {
    const auto& descriptor = *message.field(i);
    const auto tag = static_cast<std::size_t>(descriptor.number());
    if (fields.size() <= tag) fields.resize(tag + 1);
    Field field{descriptor.name(), descriptor.type(), descriptor.is_repeated(), {}, nullptr};
    if (const auto* values = descriptor.enum_type()) {
      for (int k = 0; k < values->value_count(); ++k) {
        const auto number = static_cast<std::size_t>(values->value(k)->number());
        if (field.names.size() <= number) field.names.resize(number + 1);
        if (field.names[number].empty()) field.names[number] = values->value(k)->name();
      }
    }
    if (const auto* nested = descriptor.message_type()) field.nested = &fieldsOf(*nested);
    fields[tag] = std::move(field);
  }
  return fields;
}

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
      std::abort();  // no message of the mix has such a field
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
      PlainList& list = listOf(entries, field.key);  // packed numbers
      for (const std::uint32_t number : reader.get_packed_uint32()) {
        list.push_back({std::uint64_t{number}});
      }
    } else {
      listOf(entries, field.key).push_back(valueOf(reader, field));
    }
  }
  return entries;
}

}  // namespace

EntriesReader protozeroEntries(std::uint32_t metric) {
  const Fields& fields = fieldsOf(*stockPrototype(metric)->GetDescriptor());
  return [&fields](const Bytes& bytes) {
    const auto* data = reinterpret_cast<const char*>(bytes.data());
    return entriesOf(protozero::pbf_reader(data, bytes.size()), fields);
  };
}

}  // namespace qel::bench
