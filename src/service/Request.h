// Reads the entries of a request, and says which one is at fault.
#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "base/Value.h"
#include "service/CommandCodes.h"
#include "tesk/Transport.h"

namespace qel::service {

tesk::CommandResult refusal(CommandCode code, std::string message);

// After the first entry that is missing or of another type, every reading gives nothing and refused
// holds the answer.
class Request {
 public:
  explicit Request(const Dictionary& entries) : _entries(entries) {}

  // Zero after a refusal.
  std::int64_t integer(std::string_view key);
  const Bytes* bytes(std::string_view key);
  // An integer that must be 0: the one type of payload there is.
  void payloadType();

  const std::optional<tesk::CommandResult>& refused() const { return _refused; }

 private:
  const Value* find(std::string_view key);
  void refuseType(std::string_view key, std::string_view wanted);

  const Dictionary& _entries;
  std::optional<tesk::CommandResult> _refused;
};

}  // namespace qel::service
