// Sees every call before the bus library answers it.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <functional>
#include <memory>
#include <string_view>

struct sd_bus_slot;

namespace qel::service {

// Properties, introspection and calls to methods that there are not are answered by the bus library
// itself, at once: `mayRead` decides whether they are, or refused with LimitsExceeded. Calls of the
// service's own interface pass. For as long as it is there, which ends before the connection.
class CallFilter {
 public:
  using MayRead = std::function<bool(std::string_view caller)>;

  // `object` is any of the connection.
  CallFilter(sdbus::IObject& object, MayRead mayRead);

 private:
  struct SlotEnd {
    void operator()(sd_bus_slot* slot) const;
  };

  const std::unique_ptr<MayRead> _mayRead;  // does not move
  std::unique_ptr<sd_bus_slot, SlotEnd> _slot;
};

}  // namespace qel::service
