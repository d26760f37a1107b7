#include "UsualMix.h"

#include <google/protobuf/descriptor.h>
#include <google/protobuf/message.h>

#include <cstdlib>
#include <map>
#include <memory>
#include <random>

#include "UsualKinds.h"
#include "peers/StockMessages.h"

namespace qel::bench {
namespace {

using google::protobuf::Descriptor;
using google::protobuf::FieldDescriptor;
using google::protobuf::Message;

// A source of numbers that gives the same ones on every machine.
class Dice {
 public:
  bool percent(unsigned share) { return _engine() % 100 < share; }
  std::int64_t between(std::int64_t low, std::int64_t high) {
    return low + static_cast<std::int64_t>(_engine() % static_cast<std::uint64_t>(high - low + 1));
  }

 private:
  std::mt19937_64 _engine{20180324};
};

struct Field {
  const FieldDescriptor* descriptor;
  const FieldShare* share;
  std::vector<Field> nested;
};

const FieldDescriptor& findField(const Descriptor& message, std::string_view name) {
  const auto* field = message.FindFieldByName(std::string(name));
  if (!field) std::abort();
  return *field;
}

// The shares as a tree.
std::vector<Field> fieldsOf(const KindShare& kind, const Descriptor& message) {
  std::vector<Field> fields;
  for (const FieldShare& share : kind.fields) {
    const auto dot = share.field.find('.');
    if (dot == std::string_view::npos) {
      fields.push_back({&findField(message, share.field), &share, {}});
    } else {
      Field& holder = fields.back();
      if (holder.share->field != share.field.substr(0, dot)) std::abort();
      const Descriptor& type = *holder.descriptor->message_type();
      holder.nested.push_back({&findField(type, share.field.substr(dot + 1)), &share, {}});
    }
  }
  return fields;
}

class Draw {
 public:
  Draw(Dice& dice, const Message* before) : _dice(dice), _before(before) {}

  void fill(Message& message, const std::vector<Field>& fields) { fill(message, fields, _before); }

 private:
  void fill(Message& message, const std::vector<Field>& fields, const Message* before) {
    for (const Field& field : fields) {
      if (_dice.percent(field.share->percent)) fill(message, field, before);
    }
  }

  void fill(Message& message, const Field& field, const Message* before) {
    const auto& reflection = *message.GetReflection();
    const FieldDescriptor* descriptor = field.descriptor;
    if (!descriptor->is_repeated()) {
      if (descriptor->message_type()) {
        const Message* old = before && reflection.HasField(*before, descriptor)
                                 ? &reflection.GetMessage(*before, descriptor)
                                 : nullptr;
        return fill(*reflection.MutableMessage(&message, descriptor), field.nested, old);
      }
      return setValue(message, field, before);
    }
    const auto length = _dice.between(field.share->low, field.share->high);
    const int known = before ? reflection.FieldSize(*before, descriptor) : 0;
    for (int i = 0; i < length; ++i) {
      if (!descriptor->message_type()) {
        reflection.AddUInt32(&message, descriptor, 1);
        continue;
      }
      const Message* old =
          i < known ? &reflection.GetRepeatedMessage(*before, descriptor, i) : nullptr;
      fill(*reflection.AddMessage(&message, descriptor), field.nested, old);
    }
  }

  void setValue(Message& message, const Field& field, const Message* before) {
    const auto& reflection = *message.GetReflection();
    const FieldDescriptor* descriptor = field.descriptor;
    const bool stays = before && reflection.HasField(*before, descriptor) &&
                       _dice.percent(field.share->staysPercent);
    const auto drawn = _dice.between(field.share->low, field.share->high);
    switch (descriptor->cpp_type()) {
      case FieldDescriptor::CPPTYPE_UINT32:
        return reflection.SetUInt32(
            &message, descriptor,
            stays ? reflection.GetUInt32(*before, descriptor) : static_cast<std::uint32_t>(drawn));
      case FieldDescriptor::CPPTYPE_INT32:
        return reflection.SetInt32(
            &message, descriptor,
            stays ? reflection.GetInt32(*before, descriptor) : static_cast<std::int32_t>(drawn));
      case FieldDescriptor::CPPTYPE_BOOL:
        return reflection.SetBool(&message, descriptor,
                                  stays ? reflection.GetBool(*before, descriptor) : drawn != 0);
      case FieldDescriptor::CPPTYPE_ENUM:
        return reflection.SetEnumValue(&message, descriptor,
                                       stays ? reflection.GetEnumValue(*before, descriptor)
                                             : named(*descriptor, static_cast<int>(drawn)));
      case FieldDescriptor::CPPTYPE_STRING:
        return reflection.SetString(&message, descriptor,
                                    std::string(static_cast<std::size_t>(drawn), 'x'));
      default:
        std::abort();  // no kind has such a field
    }
  }

  // The number, or the next below it that has a name.
  static int named(const FieldDescriptor& field, int number) {
    while (!field.enum_type()->FindValueByNumber(number)) --number;
    return number;
  }

  Dice& _dice;
  const Message* _before;
};

// Draws payloads of one kind, each with a look at the one before.
class KindDrawer {
 public:
  explicit KindDrawer(const KindShare& kind)
      : _prototype(*stockPrototype(kind.metric)),
        _timestamp(findField(*_prototype.GetDescriptor(), "timestamp")),
        _fields(fieldsOf(kind, *_prototype.GetDescriptor())) {}

  Bytes draw(Dice& dice, std::uint64_t time) {
    std::unique_ptr<Message> message(_prototype.New());
    message->GetReflection()->SetUInt64(message.get(), &_timestamp, time);
    Draw(dice, _before.get()).fill(*message, _fields);
    const std::string bytes = message->SerializeAsString();
    _before = std::move(message);
    return {bytes.begin(), bytes.end()};
  }

 private:
  const Message& _prototype;
  const FieldDescriptor& _timestamp;
  std::vector<Field> _fields;
  std::unique_ptr<Message> _before;
};

const KindShare& pick(Dice& dice) {
  auto roll = static_cast<unsigned>(dice.between(0, 999));
  for (const KindShare& kind : usualKinds()) {
    if (roll < kind.perMille) return kind;
    roll -= kind.perMille;
  }
  std::abort();  // the shares are not 1,000
}

}  // namespace

std::vector<Payload> usualMix(std::size_t count) {
  Dice dice;
  std::map<const KindShare*, KindDrawer> drawers;
  std::vector<Payload> payloads;
  payloads.reserve(count);
  for (std::uint64_t time = kMixStartMs; payloads.size() < count; time += kMixStepMs) {
    const KindShare& kind = pick(dice);
    KindDrawer& drawer = drawers.try_emplace(&kind, kind).first->second;
    payloads.push_back({kind.metric, drawer.draw(dice, time)});
  }
  return payloads;
}

}  // namespace qel::bench
