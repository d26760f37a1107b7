// Payloads as entries, by libprotobuf's reflection.

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <cstdlib>
#include <memory>

#include "peers/PlainEntries.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using google::protobuf::Reflection;

PlainEntries entriesOf(const Message& message);

Bytes bytesOf(const std::string& text) { return {text.begin(), text.end()}; }

PlainValue valueOf(const Message& message, const Reflection& reflection,
                   const FieldDescriptor& field) {
  std::string scratch;
  switch (field.cpp_type()) {
    case FieldDescriptor::CPPTYPE_UINT32:
      return {std::uint64_t{reflection.GetUInt32(message, &field)}};
    case FieldDescriptor::CPPTYPE_UINT64:
      return {std::uint64_t{reflection.GetUInt64(message, &field)}};
    case FieldDescriptor::CPPTYPE_INT32:
      return {std::int64_t{reflection.GetInt32(message, &field)}};
    case FieldDescriptor::CPPTYPE_BOOL:
      return {reflection.GetBool(message, &field)};
    case FieldDescriptor::CPPTYPE_ENUM:
      return {std::string_view(reflection.GetEnum(message, &field)->name())};
    case FieldDescriptor::CPPTYPE_STRING: {
      const std::string& text = reflection.GetStringReference(message, &field, &scratch);
      if (field.type() == FieldDescriptor::TYPE_BYTES) return {bytesOf(text)};
      return {text};
    }
    case FieldDescriptor::CPPTYPE_MESSAGE:
      return {entriesOf(reflection.GetMessage(message, &field))};
    default:
      std::abort();  // no metric message has such a field
  }
}

PlainList listOf(const Message& message, const Reflection& reflection,
                 const FieldDescriptor& field) {
  PlainList list;
  const int count = reflection.FieldSize(message, &field);
  list.reserve(static_cast<std::size_t>(count));
  for (int i = 0; i < count; ++i) {
    if (field.cpp_type() == FieldDescriptor::CPPTYPE_MESSAGE) {
      list.push_back({entriesOf(reflection.GetRepeatedMessage(message, &field, i))});
    } else if (field.cpp_type() == FieldDescriptor::CPPTYPE_UINT32) {
      list.push_back({std::uint64_t{reflection.GetRepeatedUInt32(message, &field, i)}});
    } else if (field.cpp_type() == FieldDescriptor::CPPTYPE_INT32) {
      list.push_back({std::int64_t{reflection.GetRepeatedInt32(message, &field, i)}});
    } else {
      std::abort();
    }
  }
  return list;
}

PlainEntries entriesOf(const Message& message) {
  const Reflection& reflection = *message.GetReflection();
  std::vector<const FieldDescriptor*> fields;
  reflection.ListFields(message, &fields);
  PlainEntries entries;
  entries.reserve(fields.size());
  for (const FieldDescriptor* field : fields) {
    if (field->is_repeated()) {
      entries.push_back({field->name(), {listOf(message, reflection, *field)}});
    } else {
      entries.push_back({field->name(), valueOf(message, reflection, *field)});
    }
  }
  return entries;
}

}  // namespace

EntriesReader stockEntries(std::uint32_t metric) {
  return [prototype = stockPrototype(metric)](const Bytes& bytes) {
    const std::unique_ptr<Message> message(prototype->New());
    if (!message->ParseFromArray(bytes.data(), static_cast<int>(bytes.size()))) std::abort();
    return entriesOf(*message);
  };
}

}  // namespace qel::bench
