// Random messages, the same for the same number.
#pragma once

#include <google/protobuf/message.h>

#include <cstdint>
#include <memory>
#include <random>
#include <string_view>

#include "base/Bytes.h"

namespace qel::testing {

class RandomMessages {
 public:
  explicit RandomMessages(std::uint64_t number) : _engine(number) {}

  // A message of the class with about two thirds of its fields present, their values often at the
  // ends of their ranges. Enumerations hold named values only, as the stock runtime keeps no
  // others. Field numbers that are metric identifiers are left out: those are never decoded.
  std::unique_ptr<google::protobuf::Message> message(std::string_view className);

  // The bytes of such a message.
  Bytes encoded(std::string_view className);

  // Up to `most`, that included.
  std::uint64_t upTo(std::uint64_t most);
  std::uint64_t varintValue();
  Bytes bytes(std::size_t most);

 private:
  void fill(google::protobuf::Message& message);
  void fillField(google::protobuf::Message& message,
                 const google::protobuf::FieldDescriptor& field);
  void fillSingle(google::protobuf::Message& message,
                  const google::protobuf::FieldDescriptor& field);
  void fillRepeated(google::protobuf::Message& message,
                    const google::protobuf::FieldDescriptor& field);
  std::string text(std::size_t most);

  std::mt19937_64 _engine;
};

Bytes serialized(const google::protobuf::Message& message);

}  // namespace qel::testing
