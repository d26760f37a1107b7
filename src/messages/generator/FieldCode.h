// The C++ code of one field of a message class.
#pragma once

#include <google/protobuf/descriptor.h>

#include <map>
#include <string>

namespace qel::generator {

// Presence bits by field: the 64-bit field first, then the others by property name.
using PresenceBits = std::map<const google::protobuf::FieldDescriptor*, int>;
PresenceBits presenceBits(const google::protobuf::Descriptor& message);

// What a field is in the message class, each as C++ text.
struct FieldCode {
  std::string accessors;  // public operations
  std::string member;     // the stored value
  std::string tableRow;   // its row of kFields
};

// Ends the generator with a message when the schema uses what metric messages do not have.
FieldCode fieldCode(const google::protobuf::FieldDescriptor& field, const PresenceBits& bits);

}  // namespace qel::generator
