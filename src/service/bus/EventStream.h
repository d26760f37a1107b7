// The service's end of one client's event stream.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string_view>

#include "base/Bytes.h"
#include "service/bus/Backlogs.h"
#include "tesk/Message.h"

namespace qel::service {

// Events go straight into the socket while it takes them. When the client does not read, they wait
// here, at most kLargestBacklog bytes, and less when many clients do not read; beyond that the
// oldest are dropped and counted. send may be called from any thread; the rest belongs to the
// thread that polls.
class EventStream {
 public:
  static constexpr std::size_t kLargestBacklog = Backlogs::kLargest;

  // Takes the descriptor, which must not block. `backlogBegins` is called, from any thread, when
  // events begin to wait. Their backlog is one of `backlogs`.
  EventStream(int descriptor, std::function<void()> backlogBegins,
              std::shared_ptr<Backlogs> backlogs = std::make_shared<Backlogs>());
  ~EventStream();
  EventStream(const EventStream&) = delete;
  EventStream& operator=(const EventStream&) = delete;

  int descriptor() const { return _descriptor; }

  void send(std::string_view eventName, const tesk::Message& event);

  // What poll shall wait for: room when events wait, and always the client's end.
  short pollEvents() const;
  // Writes what waits, as far as there is room.
  void flush();

  bool isBroken() const;
  std::uint64_t dropped() const;

 private:
  enum class Written { yes, full, broken };
  Written write(ByteView packet) const;

  const int _descriptor;
  const std::function<void()> _backlogBegins;
  const std::shared_ptr<Backlogs> _backlogs;  // their lock guards what follows
  Backlog _backlog;
  bool _broken = false;
};

}  // namespace qel::service
