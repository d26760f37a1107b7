#include "ShapedPayloads.h"

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <random>
#include <utility>

#include "messages/runtime/PBDataReader.h"
#include "messages/runtime/PBDataWriter.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;

Bytes shuffled(std::mt19937& dice, const Descriptor& schema, const Bytes& bytes);

// One field with its tag, and shuffled within.
Bytes nextField(std::mt19937& dice, const Descriptor& schema, PBDataReader& reader) {
  const std::uint64_t tag = PBReaderReadVarint(reader);
  const auto number = static_cast<std::uint32_t>(tag >> 3);
  const auto* field = schema.FindFieldByNumber(static_cast<int>(number));
  PBDataWriter writer;
  if ((tag & 7) == 0) {
    PBDataWriterWriteUint64Field(writer, PBReaderReadVarint(reader), number);
  } else {
    Bytes content = PBReaderReadData(reader).value();
    const bool isMessage = field && field->type() == FieldDescriptor::TYPE_MESSAGE;
    if (isMessage) content = shuffled(dice, *field->message_type(), content);
    PBDataWriterWriteDataField(writer, content, number);
  }
  return writer.takeData();
}

Bytes shuffled(std::mt19937& dice, const Descriptor& schema, const Bytes& bytes) {
  std::vector<Bytes> fields;
  PBDataReader reader(bytes);
  while (!reader.left().empty()) fields.push_back(nextField(dice, schema, reader));
  Bytes all;
  while (!fields.empty()) {
    std::swap(fields.back(), fields[dice() % fields.size()]);
    all.insert(all.end(), fields.back().begin(), fields.back().end());
    fields.pop_back();
  }
  return all;
}

}  // namespace

std::vector<Payload> withUnknownField(const std::vector<Payload>& payloads) {
  constexpr std::uint32_t kNumber = 100;  // of no field and of no metric
  PBDataWriter writer;
  PBDataWriterWriteUint32Field(writer, 1, kNumber);
  std::vector<Payload> shaped = payloads;
  for (Payload& payload : shaped) {
    const ByteView field = writer.data();
    payload.bytes.insert(payload.bytes.end(), field.begin(), field.end());
  }
  return shaped;
}

std::vector<Payload> inAnyOrder(const std::vector<Payload>& payloads) {
  std::mt19937 dice(20170714);
  std::vector<Payload> shaped = payloads;
  for (Payload& payload : shaped) {
    const Descriptor& schema = *stockPrototype(payload.metric)->GetDescriptor();
    payload.bytes = shuffled(dice, schema, payload.bytes);
  }
  return shaped;
}

}  // namespace qel::bench
