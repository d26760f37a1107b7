// Messages of LTE's mobility management (24.301, clause 8.2), as far as they are of use here.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "base/Bytes.h"
#include "sources/diagnostics/picture/EmmPart.h"

namespace qel::diagnostics {

enum class EmmType : std::uint8_t {
  other = 0,
  attachRequest = 0x41,
  attachAccept = 0x42,
  attachReject = 0x44,
  detachRequest = 0x45,
  detachAccept = 0x46,
  updateRequest = 0x48,  // of the tracking area
  updateAccept = 0x49,
  updateReject = 0x4B,
  extendedServiceRequest = 0x4C,
  serviceRequest = 0x4D,
  serviceReject = 0x4E,
  identityCommand = 0x50,  // a new GUTI
};

// What the message says; the rest is absent.
struct EmmMessage {
  EmmType type = EmmType::other;
  std::optional<std::int32_t> procedure;   // EmmProcedure, of requests
  std::optional<std::uint8_t> detachType;  // low three bits
  std::optional<std::uint32_t> cause;
  std::optional<std::uint8_t> t3412;
  std::optional<std::uint8_t> longT3412;
  std::optional<std::vector<TrackingArea>> areas;
  std::optional<TemporaryIdentity> identity;
  std::optional<std::vector<PlmnCode>> equivalents;
  std::optional<bool> voice;
  std::optional<bool> emergency;
  std::optional<std::uint32_t> activeBearers;  // bit N: bearer N
};

// Any thread. Nothing when it is damaged. What is ciphered is `other`.
std::optional<EmmMessage> readEmmMessage(ByteView message);

}  // namespace qel::diagnostics
