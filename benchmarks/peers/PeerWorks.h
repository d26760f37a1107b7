// The same works by others.
#pragma once

#include "Works.h"

namespace qel::bench {

// libprotobuf, with the classes that it makes of our schemas.
Step decodeStock(const std::vector<Payload>& payloads);
Step encodeStock(const std::vector<Payload>& payloads);
Step entriesStock(const std::vector<Payload>& payloads);  // by reflection

// protozero, into structs that own what they hold: on the stack, as long as the work lasts, or made
// to be kept by a std::shared_ptr, as ours are.
Step decodeProtozero(const std::vector<Payload>& payloads);
Step keepProtozero(const std::vector<Payload>& payloads);
Step encodeProtozero(const std::vector<Payload>& payloads);
Step entriesProtozero(const std::vector<Payload>& payloads);  // without structs between

// nanopb, into structs of fixed size, on the stack.
Step decodeNanopb(const std::vector<Payload>& payloads);
Step encodeNanopb(const std::vector<Payload>& payloads);

Step textFmt(const std::vector<Payload>& payloads);
Step timeStrftime(const std::vector<Payload>& payloads);

// A metric event the plain way: libprotobuf's reflection into a std::map, streams and strftime.
// Logs and keeps the record, but derives nothing for the screens from it.
Step eventStock(const std::vector<Payload>& payloads);

// Ends the program unless every peer reads and writes every field and comes to our results.
void checkPeers();

}  // namespace qel::bench
