#include "service/bus/CallFilter.h"

#include <systemd/sd-bus.h>

#include <utility>

#include "service/bus/OpenedMessage.h"
#include "tesk/bus/BasebandManager1Adaptor.h"

namespace qel::service {
namespace {

constexpr const char* kInterface = tesk::BasebandManager1_adaptor::INTERFACE_NAME;

int filter(sd_bus_message* message, void* mayGoOn, sd_bus_error* /*error*/) {
  constexpr int kGoesOn = 0;
  constexpr int kIsAnswered = 1;
  if (sd_bus_message_is_method_call(message, nullptr, nullptr) <= 0) return kGoesOn;
  const auto kind = sd_bus_message_is_method_call(message, kInterface, nullptr) > 0
                        ? CallFilter::Kind::own
                        : CallFilter::Kind::answeredAtOnce;
  const char* caller = sd_bus_message_get_sender(message);
  if ((*static_cast<CallFilter::MayGoOn*>(mayGoOn))(kind, caller ? caller : "")) return kGoesOn;
  const sd_bus_error refused{SD_BUS_ERROR_LIMITS_EXCEEDED, "too many calls of this caller", 0};
  sd_bus_reply_method_error(message, &refused);
  return kIsAnswered;
}

}  // namespace

void CallFilter::SlotEnd::operator()(sd_bus_slot* slot) const { sd_bus_slot_unref(slot); }

CallFilter::CallFilter(sdbus::IObject& object, MayGoOn mayGoOn)
    : _mayGoOn(std::make_unique<MayGoOn>(std::move(mayGoOn))) {
  const sdbus::Signal any = object.createSignal(kInterface, "Any");
  sd_bus* bus = sd_bus_message_get_bus(OpenedMessage::within(any));
  sd_bus_slot* slot = nullptr;
  const int result = sd_bus_add_filter(bus, &slot, &filter, _mayGoOn.get());
  if (result < 0) throw sdbus::createError(-result, "no filter for calls");
  _slot.reset(slot);
}

}  // namespace qel::service
