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
#include "history/ServingScale.h"

namespace qel {

// Reads them, but for values that the quantity cannot have; keeps nothing but where in records they
// stand.
class ServingReader {
 public:
  static constexpr std::int64_t kNone = INT64_MIN;

  ServingReader();

  // Whether reports of the metric carry any; then a number for read().
  static std::optional<std::size_t> placeOf(std::int64_t metric);
  // Calls take(quantity, value) for each; of several receivers the better one (36.214, clause
  // 5.1.1). `record` as the dispatcher stores it, or as it comes out of the codec.
  template <class Take>
  void read(std::size_t place, const Dictionary& record, Take take);

  // The same of a payload of kLteServingMeasurement, in two steps. Nothing when it cannot be
  // decoded.
  struct Measurement {
    std::int64_t rsrp = kNone;
    std::int64_t rsrq = kNone;
    std::int64_t sinr = kNone;
  };
  static std::optional<Measurement> readMeasurement(ByteView payload);
  template <class Take>
  static void tell(const Measurement& measurement, Take take) {
    tell(kRsrpIndex, measurement.rsrp, take);
    tell(kRsrqIndex, measurement.rsrq, take);
    tell(kSnr, measurement.sinr, take);
  }

  // As receivers report them: 36.133, 9.1.4 and 9.1.7.
  static constexpr ServingScale kRsrpIndex{Quantity::lteRsrp, 1, -140};
  static constexpr ServingScale kRsrqIndex{Quantity::lteRsrq, 0.5F, -19.5F};
  static constexpr ServingScale kSnr{Quantity::lteSinr};

 private:
  struct Field {
    Field(Name first, Name second, const ServingScale& its)
        : one(first), other(second), hasOther(!second.empty()), scale(its) {}
    KnownPlace one;
    KnownPlace other;  // the same of the second receiver
    bool hasOther;
    ServingScale scale;
  };
  struct Place {
    KnownPlace held;
    bool isTop = false;
    std::vector<Field> fields;
  };
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
  static std::int64_t within(const ServingScale& scale, std::int64_t number) {
    return scale.has(number) ? number : kNone;
  }
  [[gnu::noinline]] static std::int64_t otherIn(const Field& field, const Value& value);
  static std::int64_t bestIn(Field& field, const Sample& sample) {
    const std::int64_t one = numberIn(field, sample.find(field.one));
    return field.hasOther ? std::max(one, numberIn(field, sample.find(field.other))) : one;
  }
  static std::int64_t bestIn(Field& field, const List& receivers);

  template <class Take>
  static void tell(const ServingScale& scale, std::int64_t best, Take& take) {
    if (best == kNone) return;
    take(scale.quantity(), scale.valueOf(best));
  }

  std::vector<Place> _places;
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
