// The comments of a schema, as C++ comments and as running text.
#pragma once

#include <google/protobuf/descriptor.h>

#include <string>

namespace qel::generator {

// The comment as C++ comment lines; empty when there is none.
std::string commentLines(const google::protobuf::SourceLocation& location);

// The comment as text, a paragraph a line: what stands behind the item on its line, or else before
// it.
std::string commentText(const google::protobuf::SourceLocation& location);

// Where the head comment of a file is.
google::protobuf::SourceLocation headOf(const google::protobuf::FileDescriptor& file);

template <class Descriptor>
google::protobuf::SourceLocation locationOf(const Descriptor& descriptor) {
  google::protobuf::SourceLocation location;
  descriptor.GetSourceLocation(&location);
  return location;
}

template <class Descriptor>
std::string commentOf(const Descriptor& descriptor) {
  return commentLines(locationOf(descriptor));
}

template <class Descriptor>
std::string textOf(const Descriptor& descriptor) {
  return commentText(locationOf(descriptor));
}

}  // namespace qel::generator
