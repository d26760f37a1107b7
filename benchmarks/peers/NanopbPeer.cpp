#include <benchmark/benchmark.h>
#include <pb_decode.h>
#include <pb_encode.h>

#include <array>
#include <cstdlib>

#include "lte_neighbours.nano.h"
#include "lte_rrc.nano.h"
#include "lte_serving.nano.h"
#include "nas.nano.h"
#include "peers/PeerMessages.h"

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
  constexpr std::size_t kLongest = 4096;
  if (memory.empty()) memory.resize(kLongest);
  pb_ostream_t stream =
      pb_ostream_from_buffer(reinterpret_cast<pb_byte_t*>(memory.data()), memory.size());
  if (!pb_encode(&stream, nanopb::MessageDescriptor<Message>::fields(), kept)) std::abort();
  return std::string_view(memory).substr(0, stream.bytes_written);
}

template <class Message>
constexpr PeerMessage peer(std::uint32_t metric) {
  return {metric, decode<Message>, keep<Message>, encode<Message>};
}

constexpr std::array kMessages = {
    peer<qelwatch_schema_KCellularLteRsrpRsrqSinr>(20330),
    peer<qelwatch_schema_KCellularLteTxPower>(54018),
    peer<qelwatch_schema_KCellularLteNbrEutraCellMeas>(54031),
    peer<qelwatch_schema_KCellularLteRrcState>(19972),
    peer<qelwatch_schema_KCellularLteScellInfo>(16578),
    peer<qelwatch_schema_KCellularLteSelReselCellInfo>(54030),
    peer<qelwatch_schema_KCellularEmmContext>(54540),
    peer<qelwatch_schema_KCellularActivatedBearerContexts>(54541),
};

}  // namespace

std::span<const PeerMessage> nanopbMessages() { return kMessages; }

}  // namespace qel::bench
