// What the service remembers from one run to the next.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <utility>

#include "base/Bytes.h"

namespace qel::service {

// A configuration as it was installed, and the name of the client that did so last (empty: of
// nobody that is still remembered).
struct InstalledPayload {
  InstalledPayload() = default;
  InstalledPayload(Bytes installed, std::string installedBy = {})
      : payload(std::move(installed)), client(std::move(installedBy)) {}

  Bytes payload;
  std::string client;

  friend bool operator==(const InstalledPayload&, const InstalledPayload&) = default;
};

// The application of a client's last command, and when the client was last there: milliseconds
// since 1970, 0 when not known.
struct ClientUse {
  ClientUse() = default;
  ClientUse(std::int64_t used, std::uint64_t lastMs = 0) : application(used), usedMs(lastMs) {}

  std::int64_t application = 0;
  std::uint64_t usedMs = 0;

  friend bool operator==(const ClientUse&, const ClientUse&) = default;
};

struct KeptState {
  std::map<std::int64_t, InstalledPayload> configurations;  // by application
  std::map<std::string, ClientUse, std::less<>> applicationOfClient;

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

}  // namespace qel::service
