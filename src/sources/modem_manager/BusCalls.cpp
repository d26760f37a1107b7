#include "sources/modem_manager/BusCalls.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>

namespace qel::sources {
namespace {

struct RefusalRow {
  std::string_view errorName;
  Refusal refusal;
};
constexpr std::array kRefusals = {
    RefusalRow{"org.freedesktop.ModemManager1.Error.Core.Unauthorized", Refusal::denied},
    RefusalRow{"org.freedesktop.DBus.Error.AccessDenied", Refusal::denied},
    RefusalRow{"org.freedesktop.ModemManager1.Error.Core.Unsupported", Refusal::unsupported},
    RefusalRow{"org.freedesktop.DBus.Error.NotSupported", Refusal::unsupported},
    RefusalRow{"org.freedesktop.DBus.Error.UnknownMethod", Refusal::unsupported},
    RefusalRow{"org.freedesktop.DBus.Error.UnknownInterface", Refusal::unsupported},
};

}  // namespace

sdbus::IProxy& BusCalls::at(const std::string& path) {
  auto& object = _objects[path];
  if (!object) object = sdbus::createProxy(_connection, mm::kService, path);
  return *object;
}

void BusCalls::send(sdbus::IProxy& object, const sdbus::MethodCall& message, Reply reply,
                    Failure failure) {
  object.callMethod(
      message,
      [reply = std::move(reply), failure = std::move(failure)](sdbus::MethodReply& answer,
                                                               const sdbus::Error* error) {
        if (error) return failure(*error);
        try {
          reply(answer);
        } catch (const sdbus::Error& nonsense) {
          failure(nonsense);
        }
      },
      _timeout);
}

Refusal refusalOf(const sdbus::Error& error) {
  const auto row = std::ranges::find(kRefusals, error.getName(), &RefusalRow::errorName);
  if (row != kRefusals.end()) return row->refusal;
  // Without the authority there is nobody who could allow it.
  const bool noAuthority = error.getMessage().find("authorization failed") != std::string::npos;
  return noAuthority ? Refusal::denied : Refusal::none;
}

}  // namespace qel::sources
