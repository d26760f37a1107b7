// Sees every call before the bus library answers it.
#pragma once

#include <sdbus-c++/sdbus-c++.h>

#include <functional>
#include <memory>
#include <string_view>

struct sd_bus_slot;

namespace qel::service {

// Whether calls go on or are refused with LimitsExceeded, at little cost, `mayGoOn` decides, for as
// long as the filter is there, which ends before the connection.
class CallFilter {
 public:
  enum class Kind {
    own,             // of a method of the service
    answeredAtOnce,  // by the bus library: properties, introspection, methods that there are not
  };
  using MayGoOn = std::function<bool(Kind kind, std::string_view caller)>;

  // `object` is any of the connection.
  CallFilter(sdbus::IObject& object, MayGoOn mayGoOn);

 private:
  struct SlotEnd {
    void operator()(sd_bus_slot* slot) const;
  };

  const std::unique_ptr<MayGoOn> _mayGoOn;  // does not move
  std::unique_ptr<sd_bus_slot, SlotEnd> _slot;
};

}  // namespace qel::service
