// Which fields of which messages tell who somebody is.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

#include "base/Bytes.h"
#include "messages/catalogue/MetricMessages.h"
#include "recording/privacy/Pseudonyms.h"

namespace qel {

enum class IdentityShape : std::uint8_t { imsi, temporaryIdentity, opaque, address };

struct IdentityField {
  std::string_view messageClass;
  std::string_view field;
  IdentityShape shape;
};

// All of them. Wherever such a message is nested, its field is meant.
std::span<const IdentityField> identityFields();

// The payload with pseudonyms in these fields. It is decoded and encoded again, so that nothing
// that no schema knows is left in it. Nothing when it cannot be decoded.
std::optional<Bytes> withPseudonyms(const MetricMessage& metric, ByteView payload,
                                    const Pseudonyms& pseudonyms);

}  // namespace qel
