#include <benchmark/benchmark.h>

#include <array>
#include <protozero/exception.hpp>

#include "peers/PeerMessages.h"
#include "peers/ProtozeroMessages.h"

namespace qel::bench {
namespace {

std::string_view textOf(ByteView bytes) {
  return {reinterpret_cast<const char*>(bytes.data()), bytes.size()};
}

template <class Message>
bool decode(ByteView payload) {
  try {
    Message message;
    plain::read(textOf(payload), message);
    benchmark::DoNotOptimize(&message);
    benchmark::ClobberMemory();
    return true;
  } catch (const protozero::exception&) {
    return false;
  }
}

template <class Message>
std::shared_ptr<const void> keep(ByteView payload) {
  const auto message = std::make_shared<Message>();
  plain::read(textOf(payload), *message);
  return message;
}

template <class Message>
std::string_view encode(const void* kept, std::string& memory) {
  memory.clear();
  plain::write(*static_cast<const Message*>(kept), memory);
  return memory;
}

template <class Message>
constexpr PeerMessage peer(std::uint32_t metric) {
  return {metric, decode<Message>, keep<Message>, encode<Message>};
}

constexpr std::array kMessages = {
    peer<plain::KCellularLteRsrpRsrqSinr>(20330),
    peer<plain::KCellularLteTxPower>(54018),
    peer<plain::KCellularLteNbrEutraCellMeas>(54031),
    peer<plain::KCellularLteRrcState>(19972),
    peer<plain::KCellularLteScellInfo>(16578),
    peer<plain::KCellularLteSelReselCellInfo>(54030),
    peer<plain::KCellularEmmContext>(54540),
    peer<plain::KCellularActivatedBearerContexts>(54541),
};

}  // namespace

std::span<const PeerMessage> protozeroMessages() { return kMessages; }

}  // namespace qel::bench
