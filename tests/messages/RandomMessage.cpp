#include "RandomMessage.h"

#include <google/protobuf/descriptor.h>

#include <algorithm>
#include <limits>

#include "Schemas.h"
#include "base/FatalError.h"
#include "messages/catalogue/KBBMetricUtility.h"

namespace qel::testing {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using google::protobuf::Reflection;

bool isMetricIdentifier(int number) {
  const auto identifiers = KBBMetricUtility::catalogue();
  return std::ranges::any_of(identifiers, [number](const MetricName& metric) {
    return metric.identifier == static_cast<std::uint32_t>(number);
  });
}

}  // namespace

std::uint64_t RandomMessages::upTo(std::uint64_t most) {
  return most == std::numeric_limits<std::uint64_t>::max() ? _engine() : _engine() % (most + 1);
}

std::uint64_t RandomMessages::varintValue() {
  constexpr std::uint64_t kEnds[] = {0,          1,          127,        128,
                                     0x7FFFFFFF, 0x80000000, 0xFFFFFFFF, 0xFFFFFFFFFFFFFFFF};
  const std::uint64_t choice = upTo(2 * std::size(kEnds));
  if (choice < std::size(kEnds)) return kEnds[choice];
  return _engine() >> upTo(63);
}

Bytes RandomMessages::bytes(std::size_t most) {
  Bytes bytes(upTo(most));
  for (std::uint8_t& byte : bytes) byte = static_cast<std::uint8_t>(_engine());
  return bytes;
}

std::string RandomMessages::text(std::size_t most) {
  constexpr std::string_view kLetters[] = {"a", "\"", "\\", "\n", "\xC3\xA4", "\xE2\x82\xAC"};
  std::string text;
  for (std::uint64_t i = upTo(most); i > 0; --i) text += kLetters[upTo(std::size(kLetters) - 1)];
  return text;
}

void RandomMessages::fillSingle(Message& message, const FieldDescriptor& field) {
  const Reflection& access = *message.GetReflection();
  const std::uint64_t value = varintValue();
  const auto low = static_cast<std::uint32_t>(value);
  switch (field.type()) {
    case FieldDescriptor::TYPE_UINT64:
      access.SetUInt64(&message, &field, value);
      break;
    case FieldDescriptor::TYPE_UINT32:
      access.SetUInt32(&message, &field, low);
      break;
    case FieldDescriptor::TYPE_SINT32:
      access.SetInt32(&message, &field, static_cast<std::int32_t>(low));
      break;
    case FieldDescriptor::TYPE_BOOL:
      access.SetBool(&message, &field, (low & 1) != 0);
      break;
    case FieldDescriptor::TYPE_ENUM: {
      const auto count = static_cast<std::uint64_t>(field.enum_type()->value_count());
      access.SetEnum(&message, &field, field.enum_type()->value(static_cast<int>(value % count)));
      break;
    }
    case FieldDescriptor::TYPE_STRING:
      access.SetString(&message, &field, text(12));
      break;
    case FieldDescriptor::TYPE_BYTES: {
      const Bytes content = bytes(12);
      access.SetString(&message, &field, std::string(content.begin(), content.end()));
      break;
    }
    case FieldDescriptor::TYPE_MESSAGE:
      fill(*access.MutableMessage(&message, &field));
      break;
    default:
      fatalError("a type that no schema uses: " + field.full_name());
  }
}

void RandomMessages::fillRepeated(Message& message, const FieldDescriptor& field) {
  const Reflection& access = *message.GetReflection();
  for (std::uint64_t i = upTo(4); i > 0; --i) {
    const auto low = static_cast<std::uint32_t>(varintValue());
    switch (field.type()) {
      case FieldDescriptor::TYPE_UINT32:
        access.AddUInt32(&message, &field, low);
        break;
      case FieldDescriptor::TYPE_SINT32:
        access.AddInt32(&message, &field, static_cast<std::int32_t>(low));
        break;
      case FieldDescriptor::TYPE_MESSAGE:
        fill(*access.AddMessage(&message, &field));
        break;
      default:
        fatalError("a list that no schema uses: " + field.full_name());
    }
  }
}

void RandomMessages::fillField(Message& message, const FieldDescriptor& field) {
  if (field.is_repeated()) {
    fillRepeated(message, field);
  } else {
    fillSingle(message, field);
  }
}

void RandomMessages::fill(Message& message) {
  const auto& schema = *message.GetDescriptor();
  for (int i = 0; i < schema.field_count(); ++i) {
    const FieldDescriptor& field = *schema.field(i);
    if (isMetricIdentifier(field.number()) || upTo(2) == 0) continue;
    fillField(message, field);
  }
}

std::unique_ptr<Message> RandomMessages::message(std::string_view className) {
  auto message = stockMessage(schemaOf(className));
  fill(*message);
  return message;
}

Bytes RandomMessages::encoded(std::string_view className) {
  return serialized(*message(className));
}

Bytes serialized(const Message& message) {
  const std::string text = message.SerializeAsString();
  return {text.begin(), text.end()};
}

}  // namespace qel::testing
