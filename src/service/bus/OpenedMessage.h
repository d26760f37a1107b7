// The C library's message within one of the C++ library.
#pragma once

#include <sdbus-c++/Message.h>

struct sd_bus_message;

namespace qel::service {

// For what the C++ library has no words for. Only who derives from its class may look.
struct OpenedMessage : sdbus::Message {
  static sd_bus_message* within(const sdbus::Message& message) {
    return static_cast<sd_bus_message*>(message.*(&OpenedMessage::msg_));
  }
};

}  // namespace qel::service
