// Packed repeated scalars: growable arrays of 32-bit values and the functions over them.
#pragma once

#include <cstdint>
#include <span>

#include "base/Sequence.h"
#include "base/Value.h"

namespace qel {

template <class T>
struct PBRepeated {
  Sequence<T> values;

  const T* list() const { return values.data(); }
  std::size_t count() const { return values.size(); }
  // A std::out_of_range "idx (I) is out of range (COUNT)" for an index not below the count.
  T at(std::size_t index) const;
};

using PBRepeatedUInt32 = PBRepeated<std::uint32_t>;
using PBRepeatedInt32 = PBRepeated<std::int32_t>;

void PBRepeatedUInt32Add(PBRepeatedUInt32& array, std::uint32_t value);
void PBRepeatedUInt32Clear(PBRepeatedUInt32& array);
void PBRepeatedUInt32Copy(PBRepeatedUInt32& destination, const PBRepeatedUInt32& source);
void PBRepeatedUInt32Set(PBRepeatedUInt32& array, const std::uint32_t* list, std::size_t count);
bool PBRepeatedUInt32IsEqual(const PBRepeatedUInt32& a, const PBRepeatedUInt32& b);
std::size_t PBRepeatedUInt32Hash(const PBRepeatedUInt32& array);
List PBRepeatedUInt32NSArray(const PBRepeatedUInt32& array);

void PBRepeatedInt32Add(PBRepeatedInt32& array, std::int32_t value);
void PBRepeatedInt32Clear(PBRepeatedInt32& array);
void PBRepeatedInt32Copy(PBRepeatedInt32& destination, const PBRepeatedInt32& source);
void PBRepeatedInt32Set(PBRepeatedInt32& array, const std::int32_t* list, std::size_t count);
bool PBRepeatedInt32IsEqual(const PBRepeatedInt32& a, const PBRepeatedInt32& b);
std::size_t PBRepeatedInt32Hash(const PBRepeatedInt32& array);
List PBRepeatedInt32NSArray(const PBRepeatedInt32& array);

}  // namespace qel
