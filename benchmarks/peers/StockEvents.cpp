// Metric events with libprotobuf's reflection, without anything between message and line.

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <array>
#include <cstdlib>

#include "MemorySink.h"
#include "peers/KeptEvents.h"
#include "peers/PeerWorks.h"
#include "peers/PlainCode.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using google::protobuf::Reflection;

class TextWriter {
 public:
  explicit TextWriter(Line& out) : _out(out) {}

  // `time` goes in place of the field `timed`.
  void append(const Message& message, const FieldDescriptor* timed, std::string_view time) {
    const Reflection& reflection = *message.GetReflection();
    auto& fields = _fields.at(_depth++);
    fields.clear();
    reflection.ListFields(message, &fields);
    _out.literal("{");
    for (const FieldDescriptor* field : fields) {
      _out.literal("\"");
      _out.append(field->name());
      _out.literal("\": ");
      if (field == timed && !time.empty()) {
        plain::quoted(_out, time);
      } else if (field->is_repeated()) {
        appendList(message, reflection, *field);
      } else {
        appendValue(message, reflection, *field);
      }
    }
    plain::close(_out, --_depth > 0 ? "}, " : "}");
  }

 private:
  void appendValue(const Message& message, const Reflection& reflection,
                   const FieldDescriptor& field) {
    switch (field.cpp_type()) {
      case FieldDescriptor::CPPTYPE_UINT32:
        return _out.number(reflection.GetUInt32(message, &field));
      case FieldDescriptor::CPPTYPE_UINT64:
        return _out.number(reflection.GetUInt64(message, &field));
      case FieldDescriptor::CPPTYPE_INT32:
        return _out.number(reflection.GetInt32(message, &field));
      case FieldDescriptor::CPPTYPE_BOOL:
        return plain::truth(_out, reflection.GetBool(message, &field));
      case FieldDescriptor::CPPTYPE_ENUM:
        return plain::quoted(_out, reflection.GetEnum(message, &field)->name());
      case FieldDescriptor::CPPTYPE_STRING: {
        const std::string& text = reflection.GetStringReference(message, &field, &_scratch);
        return field.type() == FieldDescriptor::TYPE_BYTES ? plain::hexadecimal(_out, text)
                                                           : plain::quoted(_out, text);
      }
      case FieldDescriptor::CPPTYPE_MESSAGE:
        return append(reflection.GetMessage(message, &field), nullptr, {});
      default:
        std::abort();  // no metric message has such a field
    }
  }

  void appendList(const Message& message, const Reflection& reflection,
                  const FieldDescriptor& field) {
    _out.literal("[");
    const int count = reflection.FieldSize(message, &field);
    for (int i = 0; i < count; ++i) {
      if (field.cpp_type() == FieldDescriptor::CPPTYPE_MESSAGE) {
        append(reflection.GetRepeatedMessage(message, &field, i), nullptr, {});
      } else if (field.cpp_type() == FieldDescriptor::CPPTYPE_INT32) {
        _out.number(reflection.GetRepeatedInt32(message, &field, i));
      } else {
        _out.number(reflection.GetRepeatedUInt32(message, &field, i));
      }
    }
    plain::close(_out, "], ");
  }

  static std::array<std::vector<const FieldDescriptor*>, 8> _fields;  // by depth
  Line& _out;
  std::string _scratch;
  std::size_t _depth = 0;
};

std::array<std::vector<const FieldDescriptor*>, 8> TextWriter::_fields;

class MessageRecord {
 public:
  explicit MessageRecord(std::uint32_t metric)
      : _message(stockPrototype(metric)->New()),
        _timestamp(_message->GetDescriptor()->FindFieldByName("timestamp")) {}

  std::optional<std::uint64_t> read(ByteView payload) {
    if (!_message->ParseFromArray(payload.data(), static_cast<int>(payload.size()))) std::abort();
    const Reflection& reflection = *_message->GetReflection();
    if (!reflection.HasField(*_message, _timestamp)) return std::nullopt;
    return reflection.GetUInt64(*_message, _timestamp);
  }
  void appendText(std::string_view time, Line& out) const {
    TextWriter(out).append(*_message, _timestamp, time);
  }

 private:
  std::unique_ptr<Message> _message;
  const FieldDescriptor* _timestamp;
};

}  // namespace

Step eventStock(const std::vector<Payload>& payloads) {
  setStandardOutput(std::make_shared<MemorySink>());
  return keptEvents<MessageRecord>(payloads);
}

}  // namespace qel::bench
