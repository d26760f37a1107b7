// Laws that hold for every message class, tried on random messages.
#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "FieldAccess.h"
#include "MessageClasses.h"
#include "RandomMessage.h"

namespace qel::testing {

template <class Message>
std::shared_ptr<Message> randomMessage(std::uint64_t number) {
  return Message::initWithData(RandomMessages(number).encoded(Message::kClassName));
}

// Calls law.operator()<Message>(number) for every class with twenty numbers of random messages.
template <class Law>
void forAllClasses(Law&& law) {
  AllMessages::forEach([&]<class Message>() {
    for (std::uint64_t number = 1; number <= 20; ++number) {
      SCOPED_TRACE(std::string(Message::kClassName) + " number " + std::to_string(number));
      law.template operator()<Message>(number);
    }
  });
}

// Whether both dictionary forms have the same under the key, be it nothing.
inline bool sameEntry(const PBCodable& a, const PBCodable& b, std::string_view key) {
  const Dictionary one = a.dictionaryRepresentation();
  const Dictionary other = b.dictionaryRepresentation();
  const Value* mine = one.find(key);
  const Value* theirs = other.find(key);
  return mine && theirs ? *mine == *theirs : mine == theirs;
}

}  // namespace qel::testing
