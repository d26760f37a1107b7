// Stand-ins for identities: of the same shape, the same for the same value, and of no use to
// whoever does not hold the key.
#pragma once

#include <cstdint>

#include "base/Bytes.h"
#include "recording/privacy/SipHash.h"

namespace qel {

// A pseudonym is never the value that it stands for, except where said. Any thread.
class Pseudonyms {
 public:
  explicit Pseudonyms(const SipKey& key) : _key(key) {}
  // With a key from the system's random source, known to nobody. Without such a source: a fatal
  // error.
  static Pseudonyms random();

  // An IMSI in packed digits, with or without length and type before them: the digits of country
  // and network stay, the subscriber's are replaced by digits. What is no IMSI is replaced whole.
  Bytes imsi(ByteView value) const;
  // TMSI, P-TMSI or M-TMSI, 32 bits: the two top bits, which tell them apart, stay. All ones, for
  // no identity, stays.
  std::uint32_t temporaryIdentity(std::uint32_t value) const;
  // As many bytes, all replaced.
  Bytes opaque(ByteView value) const;
  // Four bytes become an address in 10.0.0.0/8, sixteen one in fd00::/8; an IPv4 address beside an
  // IPv6 address or an interface identifier is told apart by the size; other sizes are replaced
  // whole. All zeros, for no address, stays.
  Bytes address(ByteView value) const;

 private:
  enum class Domain : std::uint8_t { imsi = 1, temporaryIdentity, opaque, address };

  // `count` bytes that follow from key, domain, value and attempt.
  Bytes stream(Domain domain, ByteView value, std::uint8_t attempt, std::size_t count) const;
  Bytes addressPart(ByteView value) const;
  Bytes prefixedAddress(ByteView value, std::uint8_t prefix) const;

  SipKey _key;
};

}  // namespace qel
