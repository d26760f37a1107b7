// The same works by others.
#pragma once

#include "Works.h"

namespace qel::bench {

// libprotobuf, with the classes that it makes of our schemas.
Step decodeStock(const std::vector<Payload>& payloads);
Step encodeStock(const std::vector<Payload>& payloads);
Step entriesStock(const std::vector<Payload>& payloads);  // by reflection

// protozero, into structs that own what they hold, by code that is made of the schemas: on the
// stack, as long as the work lasts, or made to be kept by a std::shared_ptr, as ours are.
Step decodeProtozero(const std::vector<Payload>& payloads);
Step keepProtozero(const std::vector<Payload>& payloads);
Step encodeProtozero(const std::vector<Payload>& payloads);
Step encodeSized(const std::vector<Payload>& payloads);       // by generated code, lengths first
Step entriesProtozero(const std::vector<Payload>& payloads);  // without structs between
Step entriesFlat(const std::vector<Payload>& payloads);  // as views, in a row that is used again

// nanopb, into structs of fixed size, on the stack.
Step decodeNanopb(const std::vector<Payload>& payloads);
Step encodeNanopb(const std::vector<Payload>& payloads);

Step textFmt(const std::vector<Payload>& payloads);
Step textPlain(const std::vector<Payload>& payloads);  // of the struct, by generated code
Step timeStrftime(const std::vector<Payload>& payloads);
Step timeKept(const std::vector<Payload>& payloads);  // made once a minute

// A metric event as one would write it who counts instructions (KeptEvents.h), with libprotobuf's
// reflection or with protozero and generated code. Logs and keeps the newest record of each metric,
// but derives nothing for the screens from it.
Step eventStock(const std::vector<Payload>& payloads);
Step eventProtozero(const std::vector<Payload>& payloads);
// The same without further thought: reflection into a std::map, streams and strftime.
Step eventNaive(const std::vector<Payload>& payloads);

// Ends the program unless every peer reads and writes every field and comes to our results, on
// every payload of the mixes.
void checkPeers(const std::vector<Mix>& mixes);

}  // namespace qel::bench
