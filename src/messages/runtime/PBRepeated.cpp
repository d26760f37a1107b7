#include "messages/runtime/PBRepeated.h"

#include <stdexcept>
#include <string>

namespace qel {
namespace {

template <class T>
void clear(PBRepeated<T>& array) {
  array.values = {};
}

template <class T>
void set(PBRepeated<T>& array, const T* list, std::size_t count) {
  array.values = Sequence<T>(list, list + count);
}

template <class T>
std::size_t hash(const PBRepeated<T>& array) {
  std::size_t result = array.count();
  for (const T value : array.values) result = result * 31 + static_cast<std::size_t>(value);
  return result;
}

template <class T>
List numbers(const PBRepeated<T>& array) {
  return List(array.values.begin(), array.values.end());
}

}  // namespace

template <class T>
T PBRepeated<T>::at(std::size_t index) const {
  if (index >= count()) {
    throw std::out_of_range("idx (" + std::to_string(index) + ") is out of range (" +
                            std::to_string(count()) + ")");
  }
  return values[index];
}

template struct PBRepeated<std::uint32_t>;
template struct PBRepeated<std::int32_t>;

void PBRepeatedUInt32Add(PBRepeatedUInt32& array, std::uint32_t value) {
  array.values.push_back(value);
}
void PBRepeatedUInt32Clear(PBRepeatedUInt32& array) { clear(array); }
void PBRepeatedUInt32Copy(PBRepeatedUInt32& destination, const PBRepeatedUInt32& source) {
  destination = source;
}
void PBRepeatedUInt32Set(PBRepeatedUInt32& array, const std::uint32_t* list, std::size_t count) {
  set(array, list, count);
}
bool PBRepeatedUInt32IsEqual(const PBRepeatedUInt32& a, const PBRepeatedUInt32& b) {
  return a.values == b.values;
}
std::size_t PBRepeatedUInt32Hash(const PBRepeatedUInt32& array) { return hash(array); }
List PBRepeatedUInt32NSArray(const PBRepeatedUInt32& array) { return numbers(array); }

void PBRepeatedInt32Add(PBRepeatedInt32& array, std::int32_t value) {
  array.values.push_back(value);
}
void PBRepeatedInt32Clear(PBRepeatedInt32& array) { clear(array); }
void PBRepeatedInt32Copy(PBRepeatedInt32& destination, const PBRepeatedInt32& source) {
  destination = source;
}
void PBRepeatedInt32Set(PBRepeatedInt32& array, const std::int32_t* list, std::size_t count) {
  set(array, list, count);
}
bool PBRepeatedInt32IsEqual(const PBRepeatedInt32& a, const PBRepeatedInt32& b) {
  return a.values == b.values;
}
std::size_t PBRepeatedInt32Hash(const PBRepeatedInt32& array) { return hash(array); }
List PBRepeatedInt32NSArray(const PBRepeatedInt32& array) { return numbers(array); }

}  // namespace qel
