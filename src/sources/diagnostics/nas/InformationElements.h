// Reads messages of the non-access stratum: elements one behind the other (24.007, clause 11.2).
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

#include "base/Bytes.h"

namespace qel::diagnostics {

// The mandatory part of a message, in the order of its table. One that is not there leaves the
// reader failed, and so does each after it. Values lie in the message's memory.
class ElementReader {
 public:
  explicit ElementReader(ByteView message) : _rest(message) {}

  std::uint8_t octet();                // 0 once failed
  ByteView value(std::size_t length);  // empty once failed
  ByteView counted();                  // behind a length of one octet
  ByteView longCounted();              // behind a length of two

  bool failed() const { return _failed; }
  ByteView rest() const { return _rest; }

 private:
  ByteView _rest;
  bool _failed = false;
};

// Elements whose value has always the same length have it nowhere in the message.
struct FixedElement {
  std::uint8_t identifier;
  std::uint8_t length;  // without the identifier
};

// Of identifiers 70 to 7F only some protocols have elements with a length of two octets.
enum class Protocol : std::uint8_t { gsmAndUmts, eps };

// Of an element of one octet the identifier is its upper half, with 0 below, and the value the
// octet itself.
struct Element {
  std::uint8_t identifier = 0;
  ByteView value;
};

// The optional part: elements by identifier, those that nobody knows among them.
class OptionalElements {
 public:
  OptionalElements(ByteView rest, Protocol protocol, std::span<const FixedElement> fixed)
      : _reader(rest), _protocol(protocol), _fixed(fixed) {}

  // Nothing at the end, and where an element is longer than the message.
  std::optional<Element> next();

  bool failed() const { return _reader.failed(); }

 private:
  ElementReader _reader;
  const Protocol _protocol;
  const std::span<const FixedElement> _fixed;
};

// The timers' values in seconds (24.008, clauses 10.5.7.3 and 10.5.7.4a); 0 when switched off.
std::uint32_t timerS(std::uint8_t octet);
std::uint32_t longTimerS(std::uint8_t octet);

}  // namespace qel::diagnostics
