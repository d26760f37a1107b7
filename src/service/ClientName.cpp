#include "service/ClientName.h"

#include "base/Utf8.h"
#include "service/Limits.h"

namespace qel::service {
namespace {

static_assert(limits::kClientNameBytes == 64, "the message names the limit");

}  // namespace

std::string_view faultOfClientName(std::string_view name) {
  if (name.empty()) return "the client name is empty";
  if (name.size() > limits::kClientNameBytes) return "the client name is longer than 64 bytes";
  if (!isValidUtf8(name)) return "the client name is not UTF-8";
  return {};
}

}  // namespace qel::service
