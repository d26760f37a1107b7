// One message of the schemas as a plain struct, and what is done with it.
#pragma once

#include <google/protobuf/descriptor.h>
#include <google/protobuf/io/printer.h>

namespace qel::bench::generator {

void printStruct(google::protobuf::io::Printer& printer,
                 const google::protobuf::Descriptor& message);

// Of a message that others hold: for their use alone.
void printHeldOperations(google::protobuf::io::Printer& printer,
                         const google::protobuf::Descriptor& message);

// Of a message that is a payload. Ends the generator when it has no timestamp.
void printMetricOperations(google::protobuf::io::Printer& printer,
                           const google::protobuf::Descriptor& message);

}  // namespace qel::bench::generator
