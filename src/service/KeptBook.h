// Which configurations are installed, by whom, and which application a client belongs to.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "base/Clock.h"
#include "service/ConfigurationStore.h"
#include "service/StateKeeper.h"
#include "service/StateSaver.h"
#include "tesk/Transport.h"

namespace qel::service {

// Any thread. Keeps within the limits whatever clients ask for, and whatever is found in the state
// of an earlier run. With a keeper, what it knows outlives the service.
class KeptBook {
 public:
  // The store holds what is installed; it and the clocks outlive the book.
  KeptBook(std::unique_ptr<StateKeeper> keeper, ConfigurationStore& store, const Clock& clock,
           sources::WaitClock& waitClock);

  // A client is there, or has gone. The first gives the application of its last command, if any.
  std::optional<std::int64_t> opened(std::string_view client);
  void closed(std::string_view client);

  // The client has sent a command of the application.
  void note(std::string_view client, std::int64_t application);
  // Each also notes the client. The answer to a configuration for which there is no room.
  std::optional<tesk::CommandResult> install(std::string_view client, std::int64_t application,
                                             const Bytes& payload,
                                             DeviceConfiguration configuration);
  void clear(std::string_view client, std::int64_t application);

 private:
  // Whether the state was found within the limits.
  bool restore();
  void restoreClients(const KeptState& kept);
  // All that follow with the lock held.
  bool noteLocked(std::string_view client, std::int64_t application);
  bool forgetOldestClient();
  void disown(std::string_view client);
  bool isUsed(std::int64_t application) const;
  bool isLongGone(std::string_view client) const;
  // The applications whose configurations have to go; nothing when all that may go are too few.
  std::optional<std::vector<std::int64_t>> givingWay(std::int64_t application,
                                                     std::size_t bytes) const;
  // For a configuration that takes more room than there was: it is kept, and saved, with what went
  // for it. For one that is refused, nothing goes.
  std::optional<tesk::CommandResult> makeRoom(std::string_view client, std::int64_t application,
                                              std::size_t bytes);

  void save(StateSaver::When when);

  ConfigurationStore& _store;
  const Clock& _clock;

  mutable std::mutex _mutex;
  KeptState _state;
  std::map<std::string, int, std::less<>> _open;  // sessions by client

  std::unique_ptr<StateSaver> _saver;  // last: its thread reads the state
};

}  // namespace qel::service
