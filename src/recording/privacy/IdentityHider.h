// Takes identities out of events before they are recorded.
#pragma once

#include <cstdint>

#include "recording/RecordedEvent.h"
#include "recording/privacy/Pseudonyms.h"

namespace qel {

// Only what is known to be harmless is left: fields that a schema knows, and numbers. Pseudonyms
// are stable as long as this lives. One thread.
class IdentityHider {
 public:
  explicit IdentityHider(Pseudonyms pseudonyms) : _pseudonyms(pseudonyms) {}

  // False when the event must not be recorded, because its payload cannot be decoded.
  bool hide(RecordedEvent& event);

  // Events for which the answer was false.
  std::uint64_t undecodable() const { return _undecodable; }
  // Events that lost a value of unknown meaning: a payload without a message class, or text or
  // bytes under another key.
  std::uint64_t stripped() const { return _stripped; }

 private:
  bool hidePayload(RecordedEvent& event);

  Pseudonyms _pseudonyms;
  std::uint64_t _undecodable = 0;
  std::uint64_t _stripped = 0;
};

}  // namespace qel
