// The levels and qualities of the serving cell in a report.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "base/Value.h"
#include "history/KnownPlace.h"
#include "history/Quantity.h"

namespace qel {

// Reads them, but for values that the quantity cannot have; keeps nothing but where in records they
// stand.
class ServingReader {
 public:
  ServingReader();

  // Whether reports of the metric carry any; then a number for read().
  static std::optional<std::size_t> placeOf(std::int64_t metric);
  // Calls take(quantity, value) for each; of several receivers the better one (36.214, clause
  // 5.1.1). `record` as the dispatcher stores it, or as it comes out of the codec.
  template <class Take>
  void read(std::size_t place, const Dictionary& record, Take take);

  // The same of a payload of kLteServingMeasurement, in two steps. Nothing when it cannot be
  // decoded.
  using Measurement = std::array<std::int64_t, 3>;  // the best of each field
  std::optional<Measurement> readMeasurement(ByteView payload) const;
  template <class Take>
  void tell(const Measurement& measurement, Take take) const {
    for (std::size_t i = 0; i < measurement.size(); ++i) {
      tell(_measured.data()[i], measurement.data()[i], take);
    }
  }

 private:
  struct Scale {
    Quantity quantity = Quantity::lteRsrp;
    float factor = 1;
    float offset = 0;
    std::int64_t lowest = 0;  // as reported, and how much more it may be
    std::uint64_t span = 0;
  };
  struct Field {
    Field(Name first, Name second) : one(first), other(second), hasOther(!second.empty()) {}
    KnownPlace one;
    KnownPlace other;  // the same of the second receiver
    bool hasOther;
    Scale scale;
  };
  struct Place {
    KnownPlace held;
    bool isTop = false;
    std::vector<Field> fields;
  };
  static constexpr std::int64_t kNone = INT64_MIN;

  // What a dictionary holds, looked up once.
  struct Sample {
    explicit Sample(const Dictionary& of) : record(of), entries(of.begin()), size(of.size()) {}
    const Value* find(KnownPlace& place) const { return place.in(record, entries, size); }
    const Dictionary& record;
    const Dictionary::Entry* entries;
    std::size_t size;
  };

  // One that the field cannot have is none.
  static std::int64_t numberIn(const Field& field, const Value* value) {
    if (!value) return kNone;
    if (value->kind() != Value::Kind::signedInteger) [[unlikely]]
      return otherIn(field, *value);
    return within(field.scale, *value->asInt64());
  }
  static std::int64_t within(const Scale& scale, std::int64_t number) {
    const auto above =
        static_cast<std::uint64_t>(number) - static_cast<std::uint64_t>(scale.lowest);
    return above <= scale.span ? number : kNone;
  }
  [[gnu::noinline]] static std::int64_t otherIn(const Field& field, const Value& value);
  static std::int64_t bestIn(Field& field, const Sample& sample) {
    const std::int64_t one = numberIn(field, sample.find(field.one));
    return field.hasOther ? std::max(one, numberIn(field, sample.find(field.other))) : one;
  }
  static std::int64_t bestIn(Field& field, const List& receivers);

  template <class Take>
  static void tell(const Scale& scale, std::int64_t best, Take& take) {
    if (best == kNone) return;
    take(scale.quantity, static_cast<float>(best) * scale.factor + scale.offset);
  }

  std::vector<Place> _places;
  std::array<Scale, 3> _measured;  // of the fields of kLteServingMeasurement
};

template <class Take>
void ServingReader::read(std::size_t number, const Dictionary& record, Take take) {
  Place& place = _places.data()[number];
  const Value* held = place.isTop ? nullptr : place.held.in(record);
  if (held && held->asList()) {
    for (Field& field : place.fields) tell(field.scale, bestIn(field, *held->asList()), take);
  } else if (const Dictionary* top = held          ? held->asDictionary()
                                     : place.isTop ? &record
                                                   : nullptr) {
    const Sample sample(*top);
    for (Field& field : place.fields) tell(field.scale, bestIn(field, sample), take);
  }
}

// Whether a report may say so.
bool isPossible(Quantity quantity, float value);

}  // namespace qel
