#include "service/bus/CallFilter.h"

#include <systemd/sd-bus.h>

#include <utility>

#include "tesk/bus/BasebandManager1Adaptor.h"

namespace qel::service {
namespace {

constexpr const char* kInterface = tesk::BasebandManager1_adaptor::INTERFACE_NAME;

// The bus library's message within: only who derives from the class may look.
struct OpenedMessage : sdbus::Message {
  static sd_bus_message* within(const sdbus::Message& message) {
    return static_cast<sd_bus_message*>(message.*(&OpenedMessage::msg_));
  }
};

bool isOwn(sd_bus_message* message) {
  return sd_bus_message_is_method_call(message, kInterface, nullptr) > 0;
}

int filter(sd_bus_message* message, void* mayRead, sd_bus_error* /*error*/) {
  constexpr int kGoesOn = 0;
  constexpr int kIsAnswered = 1;
  if (sd_bus_message_is_method_call(message, nullptr, nullptr) <= 0 || isOwn(message)) {
    return kGoesOn;
  }
  const char* caller = sd_bus_message_get_sender(message);
  if ((*static_cast<CallFilter::MayRead*>(mayRead))(caller ? caller : "")) return kGoesOn;
  const sd_bus_error refused =
      SD_BUS_ERROR_MAKE_CONST(SD_BUS_ERROR_LIMITS_EXCEEDED, "too many calls of this caller");
  sd_bus_reply_method_error(message, &refused);
  return kIsAnswered;
}

}  // namespace

void CallFilter::SlotEnd::operator()(sd_bus_slot* slot) const { sd_bus_slot_unref(slot); }

CallFilter::CallFilter(sdbus::IObject& object, MayRead mayRead)
    : _mayRead(std::make_unique<MayRead>(std::move(mayRead))) {
  const sdbus::Signal any = object.createSignal(kInterface, "Any");
  sd_bus* bus = sd_bus_message_get_bus(OpenedMessage::within(any));
  sd_bus_slot* slot = nullptr;
  const int result = sd_bus_add_filter(bus, &slot, &filter, _mayRead.get());
  if (result < 0) throw sdbus::createError(-result, "no filter for calls");
  _slot.reset(slot);
}

}  // namespace qel::service
