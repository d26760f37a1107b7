// Which message class is the payload of which metric.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "base/Bytes.h"
#include "messages/runtime/MessageShape.h"
#include "messages/runtime/PBCodable.h"

namespace qel {

// Decodes a payload: the message, or nothing when the bytes are damaged.
using DecodeMessage = std::shared_ptr<PBCodable> (*)(ByteView payload);

// The dictionary form of a payload, or nothing when the bytes are damaged.
using DescribePayload = std::optional<Dictionary> (*)(ByteView payload);

template <class Message>
std::shared_ptr<PBCodable> decodeMessage(ByteView payload) {
  return Message::initWithData(payload);
}

// Whether the bytes can be decoded. Takes no memory, whatever they are.
using CheckPayload = bool (*)(ByteView payload);

struct MetricMessage {
  std::uint32_t identifier;  // as in the catalogue, 16 bits
  std::string_view className;
  DecodeMessage decode;
  DescribePayload describe;
  CheckPayload isReadable;
  const MessageShape* shape;
};

// The 30 metrics whose payload has a message class.
std::span<const MetricMessage> metricMessages();

// By the 16-bit identifier, or nothing.
const MetricMessage* findMetricMessage(std::uint32_t identifier);

}  // namespace qel
