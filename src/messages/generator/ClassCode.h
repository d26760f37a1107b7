// The C++ code of the message classes of one schema.
#pragma once

#include <google/protobuf/descriptor.h>
#include <google/protobuf/io/printer.h>

namespace qel::generator {

// The header: a table of names an enumeration, a class a message. Ends the generator with a message
// when the fields of a message do not ascend.
void printHeader(google::protobuf::io::Printer& printer,
                 const google::protobuf::FileDescriptor& file);

// The source: the operations of the classes, made from the field tables.
void printSource(google::protobuf::io::Printer& printer,
                 const google::protobuf::FileDescriptor& file);

}  // namespace qel::generator
