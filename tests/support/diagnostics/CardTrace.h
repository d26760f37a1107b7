// What modem and card say to each other, as the modem logs it.
#pragma once

#include <cstdint>

#include "base/Bytes.h"

namespace qel::diagnostics::test {

// Bytes on the line, one item a byte; a time stamp before each command.
class CardTrace {
 public:
  CardTrace& reset();  // the card answers to being switched on
  // A command that sends data to the card.
  CardTrace& send(const Bytes& header, const Bytes& data, std::uint16_t status = 0x9000);
  // A command that asks for data; the header's length is that of the data.
  CardTrace& ask(Bytes header, const Bytes& data, std::uint16_t status = 0x9000);
  CardTrace& select(std::uint16_t file, std::uint8_t kind = 0x00);
  CardTrace& selectUsim(std::uint8_t kind = 0x00);
  CardTrace& read(const Bytes& content, std::uint8_t kind = 0x00, std::uint16_t offset = 0);

  CardTrace& toCard(const Bytes& bytes);
  CardTrace& fromCard(const Bytes& bytes);
  CardTrace& time();

  // One behind the other.
  const Bytes& items() const { return _items; }

 private:
  CardTrace& answer(std::uint16_t status);

  Bytes _items;
};

// 0x1098, behind its length.
Bytes cardLog(const Bytes& items);

}  // namespace qel::diagnostics::test
