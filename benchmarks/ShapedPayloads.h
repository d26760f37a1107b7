// The same payloads as other senders might write them.
#pragma once

#include <deque>

#include "Works.h"

namespace qel::bench {

// With a field of a later schema at the end, as newer modems send them.
std::vector<Payload> withUnknownField(const std::vector<Payload>& payloads);
// With the fields of every message, nested ones too, in any order: the same at every run.
std::vector<Payload> inAnyOrder(const std::vector<Payload>& payloads);

// A work on payloads of another shape, which stay for as long as the program runs.
template <std::vector<Payload> (*shape)(const std::vector<Payload>&),
          Step (*prepare)(const std::vector<Payload>&)>
Step onShaped(const std::vector<Payload>& payloads) {
  static std::deque<std::vector<Payload>> shaped;
  return prepare(shaped.emplace_back(shape(payloads)));
}

}  // namespace qel::bench
