// LTE's messages of the non-access stratum (24.301) and the packets that carry them.
#pragma once

#include <cstdint>
#include <initializer_list>
#include <optional>
#include <string_view>
#include <vector>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

inline constexpr std::uint16_t kEsmIn = 0xB0E2;
inline constexpr std::uint16_t kEsmOut = 0xB0E3;
inline constexpr std::uint16_t kEmmIn = 0xB0EC;
inline constexpr std::uint16_t kEmmOut = 0xB0ED;
inline constexpr std::uint16_t kEmmState = 0xB0EE;

// The body of a packet with a message in the clear.
Bytes plainNas(const Bytes& message, unsigned version = 1);

// The body of a packet 0xB0EE.
struct WrittenGuti {
  unsigned group = 0x8001;
  unsigned entity = 0x17;
  std::uint32_t mTmsi = 0xC0FFEE01;
};
Bytes emmState(unsigned state, unsigned substate, const std::optional<WrittenGuti>& guti = {});

// Elements with their identifiers; the network is 001/01.
Bytes gutiElement(const WrittenGuti& guti);
Bytes equivalentsElement(std::initializer_list<std::uint32_t> networks);  // three bytes each
Bytes featuresElement(bool voice, bool emergency);
Bytes areasValue(std::initializer_list<unsigned> codes);  // of one network

Bytes attachRequest(unsigned type);
Bytes attachAccept(unsigned t3412, const Bytes& areas, std::initializer_list<Bytes> elements = {});
Bytes attachReject(unsigned cause);
Bytes updateRequest(unsigned type);
Bytes updateAccept(std::initializer_list<Bytes> elements = {});
Bytes updateReject(unsigned cause);
Bytes serviceReject(unsigned cause);
Bytes serviceRequest();
Bytes detachRequest(unsigned type);

struct WrittenConnection {
  unsigned bearer = 5;
  std::string_view apn = "internet";  // labels with dots between them
  unsigned type = 1;                  // of the network's three
  Bytes address = {10, 0, 0, 2};
  std::vector<Bytes> nameServers = {};
};
Bytes activateConnection(const WrittenConnection& connection);
Bytes rejectActivation(unsigned bearer);
Bytes deactivateBearer(unsigned bearer);

}  // namespace qel::diagnostics::test
