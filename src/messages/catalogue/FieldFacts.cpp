#include "messages/catalogue/FieldFacts.h"

#include <algorithm>

namespace qel {
namespace {

template <class Range, class Key, class Member>
auto* firstWith(const Range& range, const Key& key, Member member) {
  const auto found = std::ranges::find(range, key, member);
  return found == range.end() ? nullptr : &*found;
}

}  // namespace

const FieldFacts* MessageFacts::find(std::string_view key) const {
  return firstWith(fields, key, &FieldFacts::key);
}

const MessageFacts* findMessageFacts(std::string_view name) {
  return firstWith(messageFacts(), name, &MessageFacts::name);
}

const MessageFacts* findPayloadFacts(std::uint32_t metric) {
  return metric == 0 ? nullptr : firstWith(messageFacts(), metric, &MessageFacts::metric);
}

}  // namespace qel
