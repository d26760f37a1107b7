// What the service remembers from one run to the next.
#pragma once

#include <cstdint>
#include <map>
#include <string>

#include "base/Bytes.h"

namespace qel::service {

struct KeptState {
  std::map<std::int64_t, Bytes> configurations;  // payloads by application
  std::map<std::string, std::int64_t, std::less<>> applicationOfClient;

  friend bool operator==(const KeptState&, const KeptState&) = default;
};

// Called by one thread at a time.
class StateKeeper {
 public:
  virtual ~StateKeeper() = default;
  // What was saved last; nothing when nothing was, or it cannot be read (which is logged).
  virtual KeptState load() = 0;
  // A failure is logged; the service goes on without.
  virtual void save(const KeptState& state) = 0;
};

// Remembers nothing.
class ForgetfulKeeper final : public StateKeeper {
 public:
  KeptState load() override { return {}; }
  void save(const KeptState&) override {}
};

}  // namespace qel::service
