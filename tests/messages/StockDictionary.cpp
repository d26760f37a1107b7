#include "StockDictionary.h"

#include <google/protobuf/descriptor.h>

#include "base/FatalError.h"

namespace qel::testing {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;

Value singleValue(const Message& message, const FieldDescriptor& field) {
  const auto& access = *message.GetReflection();
  switch (field.type()) {
    case FieldDescriptor::TYPE_UINT64:
      return std::uint64_t{access.GetUInt64(message, &field)};
    case FieldDescriptor::TYPE_UINT32:
      return access.GetUInt32(message, &field);
    case FieldDescriptor::TYPE_SINT32:
      return access.GetInt32(message, &field);
    case FieldDescriptor::TYPE_BOOL:
      return access.GetBool(message, &field);
    case FieldDescriptor::TYPE_ENUM:
      return access.GetEnum(message, &field)->name();
    case FieldDescriptor::TYPE_STRING:
      return access.GetString(message, &field);
    case FieldDescriptor::TYPE_BYTES: {
      const std::string bytes = access.GetString(message, &field);
      return Bytes(bytes.begin(), bytes.end());
    }
    case FieldDescriptor::TYPE_MESSAGE:
      return stockDictionary(access.GetMessage(message, &field));
    default:
      fatalError("a type that no schema uses: " + field.full_name());
  }
}

List elements(const Message& message, const FieldDescriptor& field) {
  const auto& access = *message.GetReflection();
  List list;
  for (int i = 0; i < access.FieldSize(message, &field); ++i) {
    switch (field.type()) {
      case FieldDescriptor::TYPE_UINT32:
        list.emplace_back(access.GetRepeatedUInt32(message, &field, i));
        break;
      case FieldDescriptor::TYPE_SINT32:
        list.emplace_back(access.GetRepeatedInt32(message, &field, i));
        break;
      case FieldDescriptor::TYPE_MESSAGE:
        list.emplace_back(stockDictionary(access.GetRepeatedMessage(message, &field, i)));
        break;
      default:
        fatalError("a list that no schema uses: " + field.full_name());
    }
  }
  return list;
}

}  // namespace

Dictionary stockDictionary(const Message& message) {
  const auto& schema = *message.GetDescriptor();
  Dictionary dictionary;
  for (int i = 0; i < schema.field_count(); ++i) {
    const FieldDescriptor& field = *schema.field(i);
    if (field.is_repeated()) {
      List list = elements(message, field);
      if (field.is_packed() || !list.empty()) dictionary.append(field.name(), std::move(list));
    } else if (message.GetReflection()->HasField(message, &field)) {
      dictionary.append(field.name(), singleValue(message, field));
    }
  }
  return dictionary;
}

}  // namespace qel::testing
