// The fields of a message by tag, for readers without classes.
#pragma once

#include <google/protobuf/descriptor.h>

#include <cstdint>
#include <string_view>
#include <vector>

namespace qel::bench {

struct Field;
using Fields = std::vector<Field>;  // by tag; those without a key do not exist

struct Field {
  std::string_view key;
  google::protobuf::FieldDescriptor::Type type{};
  bool repeated = false;
  std::vector<std::string_view> names;  // of an enum, by value
  const Fields* nested = nullptr;       // of a message
};

// Made of libprotobuf's descriptors at the first call; lives as long as the program.
const Fields& fieldsOf(std::uint32_t metric);

}  // namespace qel::bench
