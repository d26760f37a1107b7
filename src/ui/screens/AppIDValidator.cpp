#include "ui/screens/AppIDValidator.h"

namespace qel {
namespace {

constexpr std::int64_t kExpectedAppID = 2;

}  // namespace

bool AppIDValidator::validate(const Dictionary& event) {
  const Value* value = event.find(appIDKey);
  appID = value ? value->asInt64() : std::nullopt;
  return appID == kExpectedAppID;
}

}  // namespace qel
