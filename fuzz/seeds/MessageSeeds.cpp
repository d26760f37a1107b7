#include "fuzz/seeds/MessageSeeds.h"

#include "messages/FieldAccess.h"
#include "messages/MessageClasses.h"
#include "messages/Wire.h"
#include "messages/runtime/Fields.h"

namespace qel::fuzz {
namespace {

using testing::delimitedField;
using testing::varintField;

constexpr std::uint64_t kSomeNumber = 5;

template <class Message>
Bytes whole();

template <class Nested, class Message>
Bytes nestedField(std::uint64_t number, std::shared_ptr<Nested> Message::*) {
  return delimitedField(number, whole<Nested>());
}

template <class Nested, class Message>
Bytes nestedField(std::uint64_t number, MessageList<Nested> Message::*) {
  const Bytes one = delimitedField(number, whole<Nested>());
  return testing::joined(one, one);
}

template <class Field>
Bytes fieldBytes(const Field& field) {
  if constexpr (testing::kIsMessage<Field> || testing::kIsMessageList<Field>) {
    return nestedField(field.number, field.member);
  } else if constexpr (testing::kIsScalar<Field>) {
    return varintField(field.number, kSomeNumber);
  } else {
    return delimitedField(field.number, {1, 2, 3, 4});
  }
}

template <class Message>
Bytes whole() {
  Bytes bytes;
  forEachField<Message>([&](const auto& field) { testing::append(bytes, fieldBytes(field)); });
  return bytes;
}

}  // namespace

std::vector<Bytes> wholeMessages() {
  std::vector<Bytes> messages;
  testing::AllMessages::forEach([&]<class Message>() { messages.push_back(whole<Message>()); });
  return messages;
}

}  // namespace qel::fuzz
