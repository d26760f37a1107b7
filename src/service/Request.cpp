#include "service/Request.h"

#include <string>
#include <utility>

#include "tesk/Constants.h"

namespace qel::service {

tesk::CommandResult refusal(CommandCode code, std::string message) {
  return {static_cast<std::int32_t>(code), std::move(message)};
}

const Value* Request::find(std::string_view key) {
  if (_refused) return nullptr;
  const Value* value = _entries.find(key);
  // A null stands where the client could not make a value.
  if (!value || value->isNull()) {
    _refused = refusal(CommandCode::missingKey, std::string(key) + " is missing");
    return nullptr;
  }
  return value;
}

void Request::refuseType(std::string_view key, std::string_view wanted) {
  _refused = refusal(CommandCode::wrongType, std::string(key) + " is not " + std::string(wanted));
}

std::int64_t Request::integer(std::string_view key) {
  const Value* value = find(key);
  if (!value) return 0;
  // A floating number is none, even a whole one.
  const auto number = value->kind() == Value::Kind::floating ? std::nullopt : value->asInt64();
  if (number) return *number;
  refuseType(key, "a 64-bit integer");
  return 0;
}

const Bytes* Request::bytes(std::string_view key) {
  const Value* value = find(key);
  if (!value) return nullptr;
  if (const Bytes* bytes = value->asBytes()) return bytes;
  refuseType(key, "data");
  return nullptr;
}

void Request::payloadType() {
  const std::int64_t type = integer(tesk::kKeyPayloadType);
  if (_refused || type == 0) return;
  _refused = refusal(CommandCode::unsupportedPayloadType,
                     "kKeyPayloadType " + std::to_string(type) + " is not supported");
}

}  // namespace qel::service
