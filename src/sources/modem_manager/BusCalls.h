// Calls to ModemManager's objects that nobody waits for.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <chrono>
#include <functional>
#include <map>
#include <memory>
#include <string>

#include "sources/modem_manager/Names.h"

namespace qel::sources {

// One thread, that of the connection, which outlives this. A call throws sdbus::Error when the
// connection is lost. Calls are not made from within an answer.
class BusCalls {
 public:
  // What came: a reply, or an error. A reply of another type than expected throws in the handler,
  // which then counts as an error.
  using Reply = std::function<void(sdbus::MethodReply& reply)>;
  using Failure = std::function<void(const sdbus::Error& error)>;

  BusCalls(sdbus::IConnection& connection, std::chrono::milliseconds timeout)
      : _connection(connection), _timeout(timeout) {}

  template <class... Arguments>
  void call(const std::string& path, const char* interface, const char* member, Reply reply,
            Failure failure, const Arguments&... arguments) {
    sdbus::IProxy& object = at(path);
    sdbus::MethodCall message = object.createMethodCall(interface, member);
    (static_cast<void>(message << arguments), ...);
    send(object, message, std::move(reply), std::move(failure));
  }

  // Lets go of an object; what it still owes is not answered any more.
  void forget(const std::string& path) { _objects.erase(path); }

 private:
  sdbus::IProxy& at(const std::string& path);
  void send(sdbus::IProxy& object, const sdbus::MethodCall& message, Reply reply, Failure failure);

  sdbus::IConnection& _connection;
  const std::chrono::milliseconds _timeout;
  std::map<std::string, std::unique_ptr<sdbus::IProxy>> _objects;
};

// Why a call failed, as far as it matters whether to call again.
enum class Refusal { none, denied, unsupported };
Refusal refusalOf(const sdbus::Error& error);

}  // namespace qel::sources
