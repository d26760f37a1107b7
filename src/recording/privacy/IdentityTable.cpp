#include "recording/privacy/IdentityTable.h"

#include <algorithm>
#include <array>

#include "messages/nas.h"
#include "messages/runtime/Fields.h"
#include "messages/runtime/Presence.h"
#include "messages/sim.h"

namespace qel {
namespace {

using Shape = IdentityShape;

constexpr std::array kIdentityFields = {
    IdentityField{"KCellularMmCommonInfo", "imsi", Shape::imsi},
    IdentityField{"KCellularMmContext", "tmsi", Shape::temporaryIdentity},
    IdentityField{"KCellularGmmContext", "p_tmsi", Shape::temporaryIdentity},
    IdentityField{"Guti", "m_tmsi", Shape::temporaryIdentity},
    IdentityField{"ElementaryFile", "content", Shape::opaque},
    IdentityField{"BearerContext", "pdp_addr", Shape::address},
    IdentityField{"BearerContext", "primary_dns_addr", Shape::address},
    IdentityField{"BearerContext", "secondary_dns_addr", Shape::address},
};

std::optional<Shape> shapeOf(std::string_view messageClass, std::string_view field) {
  for (const IdentityField& row : kIdentityFields) {
    if (row.messageClass == messageClass && row.field == field) return row.shape;
  }
  return std::nullopt;
}

Bytes pseudonymOf(const Bytes& value, Shape shape, const Pseudonyms& pseudonyms) {
  switch (shape) {
    case Shape::imsi:
      return pseudonyms.imsi(value);
    case Shape::address:
      return pseudonyms.address(value);
    default:
      return pseudonyms.opaque(value);
  }
}

template <class Message>
void replace(Message& message, const Pseudonyms& pseudonyms);

// One overload for each kind of field that can be or hold an identity.
template <class Message>
void replaceField(Message& message,
                  const ScalarField<Message, std::uint32_t, Encoding::uint32>& field,
                  const Pseudonyms& pseudonyms) {
  if (!shapeOf(Message::kClassName, field.key)) return;
  if (!Presence::get(message, field.presenceBit)) return;
  std::uint32_t& value = message.*field.member;
  value = pseudonyms.temporaryIdentity(value);
}

template <class Message>
void replaceField(Message& message, const DataField<Message>& field, const Pseudonyms& pseudonyms) {
  const auto shape = shapeOf(Message::kClassName, field.key);
  auto& value = message.*field.member;
  if (shape && value) value = pseudonymOf(*value, *shape, pseudonyms);
}

template <class Message, class Nested>
void replaceField(Message& message, const MessageField<Message, Nested>& field,
                  const Pseudonyms& pseudonyms) {
  const auto& nested = message.*field.member;
  if (nested) replace(*nested, pseudonyms);
}

template <class Message, class Nested>
void replaceField(Message& message, const RepeatedMessageField<Message, Nested>& field,
                  const Pseudonyms& pseudonyms) {
  for (const auto& element : message.*field.member) replace(*element, pseudonyms);
}

template <class Message, class Field>
void replaceField(Message&, const Field&, const Pseudonyms&) {}

template <class Message>
void replace(Message& message, const Pseudonyms& pseudonyms) {
  forEachField<Message>([&](const auto& field) { replaceField(message, field, pseudonyms); });
}

// A metric with identities somewhere in its message.
struct Carrier {
  std::string_view messageClass;
  std::optional<Bytes> (*rewrite)(ByteView payload, const Pseudonyms& pseudonyms);
};

template <class Message>
std::optional<Bytes> rewrite(ByteView payload, const Pseudonyms& pseudonyms) {
  const auto message = Message::initWithData(payload);
  if (!message) return std::nullopt;
  replace(*message, pseudonyms);
  return message->data();
}

template <class Message>
constexpr Carrier carrier() {
  return {Message::kClassName, rewrite<Message>};
}

constexpr std::array kCarriers = {
    carrier<KCellularMmCommonInfo>(),
    carrier<KCellularMmContext>(),
    carrier<KCellularGmmContext>(),
    carrier<KCellularEmmContext>(),
    carrier<KCellularActivatedBearerContexts>(),
    carrier<KCellularSimCardFiles>(),
};

}  // namespace

std::span<const IdentityField> identityFields() { return kIdentityFields; }

std::optional<Bytes> withPseudonyms(const MetricMessage& metric, ByteView payload,
                                    const Pseudonyms& pseudonyms) {
  const auto found = std::ranges::find(kCarriers, metric.className, &Carrier::messageClass);
  if (found != kCarriers.end()) return found->rewrite(payload, pseudonyms);
  const auto message = metric.decode(payload);
  return message ? std::optional(message->data()) : std::nullopt;
}

}  // namespace qel
