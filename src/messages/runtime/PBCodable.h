// The base of every metric message.
#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

#include "base/Bytes.h"
#include "base/Value.h"
#include "messages/runtime/PBDataReader.h"
#include "messages/runtime/PBDataWriter.h"

namespace qel {

// A message is filled by one thread and then read. Bad bytes give an empty result; two messages of
// different classes in copyTo or mergeFrom are a fatal error.
class PBCodable {
 public:
  virtual ~PBCodable() = default;

  virtual std::string_view className() const = 0;

  // The class name and the dictionary form.
  virtual std::string description() const;
  // Field names to values, in field order; what is absent has no entry, but a packed repeated field
  // always has its list.
  virtual Dictionary dictionaryRepresentation() const = 0;
  // Reads fields up to the reader's end on top of what is there. False when the bytes are damaged.
  virtual bool readFrom(PBDataReader& reader) = 0;
  virtual void writeTo(PBDataWriter& writer) const = 0;
  // Lays the present fields over `destination`; nested messages are then shared by both.
  virtual void copyTo(PBCodable& destination) const = 0;
  // A copy that shares nothing.
  virtual std::shared_ptr<PBCodable> copyWithZone() const = 0;
  // Same class, same fields present, same values.
  virtual bool isEqual(const PBCodable& other) const = 0;
  virtual std::size_t hash() const = 0;
  // Lays the present fields of `source` over this message: lists grow, nested messages merge (a
  // nested message that is absent here is taken over, shared).
  virtual void mergeFrom(const PBCodable& source) = 0;

  Bytes data() const;

 protected:
  PBCodable() = default;
  PBCodable(const PBCodable&) = default;
  PBCodable& operator=(const PBCodable&) = default;
};

}  // namespace qel
