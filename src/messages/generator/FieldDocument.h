// The document of all messages and their fields.
#pragma once

#include <google/protobuf/descriptor.h>

#include <string>
#include <vector>

namespace qel::generator {

// As Markdown: a section a schema, a table a message, then the values of the enumerations.
std::string fieldDocument(const std::vector<const google::protobuf::FileDescriptor*>& schemas);

}  // namespace qel::generator
