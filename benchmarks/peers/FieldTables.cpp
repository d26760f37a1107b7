#include "peers/FieldTables.h"

#include <google/protobuf/message.h>

#include <map>

#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

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

}  // namespace

const Fields& fieldsOf(std::uint32_t metric) {
  return fieldsOf(*stockPrototype(metric)->GetDescriptor());
}

}  // namespace qel::bench
