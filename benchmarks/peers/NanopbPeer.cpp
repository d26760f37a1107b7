#include <benchmark/benchmark.h>
#include <pb_decode.h>
#include <pb_encode.h>

#include <array>
#include <cstdlib>

#include "gsm.nano.h"
#include "lte_neighbours.nano.h"
#include "lte_rrc.nano.h"
#include "lte_serving.nano.h"
#include "nas.nano.h"
#include "peers/PeerMessages.h"
#include "sim.nano.h"
#include "wcdma.nano.h"

namespace qel::bench {
namespace {

template <class Message>
bool read(ByteView payload, Message& message) {
  pb_istream_t stream = pb_istream_from_buffer(payload.data(), payload.size());
  return pb_decode(&stream, nanopb::MessageDescriptor<Message>::fields(), &message);
}

template <class Message>
bool decode(ByteView payload) {
  Message message;
  const bool done = read(payload, message);
  benchmark::DoNotOptimize(&message);
  benchmark::ClobberMemory();
  return done;
}

template <class Message>
std::shared_ptr<const void> keep(ByteView payload) {
  const auto message = std::make_shared<Message>();
  if (!read(payload, *message)) std::abort();
  return message;
}

template <class Message>
std::string_view encode(const void* kept, std::string& memory) {
  constexpr std::size_t kLongest = 65536;
  if (memory.empty()) memory.resize(kLongest);
  pb_ostream_t stream =
      pb_ostream_from_buffer(reinterpret_cast<pb_byte_t*>(memory.data()), memory.size());
  if (!pb_encode(&stream, nanopb::MessageDescriptor<Message>::fields(), kept)) std::abort();
  return std::string_view(memory).substr(0, stream.bytes_written);
}

#define PEER(metric, Message)                                                   \
  PeerMessage {                                                                 \
    metric, decode<qelwatch_schema_##Message>, keep<qelwatch_schema_##Message>, \
        encode<qelwatch_schema_##Message>                                       \
  }
constexpr std::array kMessages = {
#include <metrics.inc>
};
#undef PEER

}  // namespace

std::span<const PeerMessage> nanopbMessages() { return kMessages; }

}  // namespace qel::bench
