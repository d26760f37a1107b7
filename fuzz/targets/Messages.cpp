// Every message class with its laws: bytes to message to bytes, dictionaries, copies, merges.

#include <array>

#include "base/Rendering.h"
#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "messages/MessageClasses.h"

namespace qel::fuzz {
namespace {

void expectSame(const PBCodable& a, const PBCodable& b, std::string_view what) {
  law(a.isEqual(b) && b.isEqual(a), what);
  law(a.hash() == b.hash(), "equal messages hash alike");
  law(a.data() == b.data(), "equal messages have the same bytes");
  law(jsonText(a.dictionaryRepresentation()) == jsonText(b.dictionaryRepresentation()),
      "equal messages have the same dictionary");
}

// Whatever `merged` took from `source` it now says as `source` does. Nested dictionaries and lists
// are made of both.
void expectTaken(const PBCodable& merged, const PBCodable& source) {
  const Dictionary now = merged.dictionaryRepresentation();
  for (const auto& [key, value] : source.dictionaryRepresentation()) {
    const Value* taken = now.find(key.view());
    law(taken != nullptr, "what the source has is there after merging");
    if (value.asDictionary()) continue;
    if (const List* list = value.asList()) {
      law(taken->asList() && taken->asList()->size() >= list->size(), "lists grow");
    } else {
      law(*taken == value, "values are replaced in merging");
    }
  }
}

template <class Message>
std::shared_ptr<Message> decodedLawfully(const Bytes& bytes) {
  const auto message = Message::initWithData(bytes);
  const auto dictionary = Message::dictionaryWithData(bytes);
  law(static_cast<bool>(message) == dictionary.has_value(), "both readings take the same bytes");
  if (!message) return nullptr;
  law(jsonText(*dictionary) == jsonText(message->dictionaryRepresentation()),
      "both readings say the same");
  law(*dictionary == message->dictionaryRepresentation(), "both readings hold the same");
  const auto again = Message::initWithData(message->data());
  law(again != nullptr, "what was written can be read");
  expectSame(*message, *again, "reading what was written gives the same");
  law(!message->description().empty(), "every message has a description");
  return message;
}

template <class Message>
void tryClass(const Bytes& first, const Bytes& second) {
  const auto a = decodedLawfully<Message>(first);
  if (!a) return;
  expectSame(*a, *a->deepCopy(), "a copy is the same");
  Message copied;
  a->copyTo(copied);
  expectSame(*a, copied, "what was copied into an empty message is the same");
  Message merged;
  merged.mergeFrom(*a);
  expectSame(*a, merged, "what was merged into an empty message is the same");

  const auto b = decodedLawfully<Message>(second);
  if (!b) return;
  if (a->isEqual(*b)) expectSame(*a, *b, "equality goes both ways");
  const auto before = a->deepCopy();
  const auto both = b->deepCopy();
  both->mergeFrom(*a->deepCopy());
  expectTaken(*both, *a);
  both->mergeFrom(*both);
  law(Message::initWithData(both->data()) != nullptr, "what was merged can be read");
  expectSame(*a, *before, "a source stays as it is");
}

using TryClass = void (*)(const Bytes& first, const Bytes& second);

template <class... Messages>
constexpr auto tries(testing::MessageList<Messages...>) {
  return std::array<TryClass, sizeof...(Messages)>{tryClass<Messages>...};
}

}  // namespace

void tryInput(Input input) {
  static constexpr auto kTries = tries(testing::AllMessages());
  const std::size_t which = input.below(kTries.size());
  const Bytes first = input.piece();
  kTries[which](first, input.rest());
}

}  // namespace qel::fuzz
