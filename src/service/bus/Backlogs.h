// The events that wait for clients which do not read.
#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <mutex>
#include <vector>

#include "base/Bytes.h"

namespace qel::service {

// The packets that wait for one client, the oldest first.
struct Backlog {
  std::deque<Bytes> packets;
  std::size_t bytes = 0;
  std::uint64_t dropped = 0;
};

// The backlogs of all clients. Each has a limit and all together have one: beyond it the largest
// lose their oldest packets, so that a client which reads never loses because others do not. What
// is lost is counted. The lock guards every backlog too; all but `mutex` needs it held.
class Backlogs {
 public:
  static constexpr std::size_t kLargest = 1024 * 1024;
  static constexpr std::size_t kLargestTotal = 4 * 1024 * 1024;

  std::mutex& mutex() { return _mutex; }

  // Of a client that is there now, or not any more.
  void add(Backlog& backlog);
  void remove(Backlog& backlog);

  void push(Backlog& backlog, Bytes packet);
  void pop(Backlog& backlog);

  std::size_t bytes() const { return _bytes; }

 private:
  Backlog& largest();
  void dropOldest(Backlog& backlog);

  std::mutex _mutex;
  std::vector<Backlog*> _all;
  std::size_t _bytes = 0;
};

}  // namespace qel::service
