// The command to a SIM card that is under way, put together of pieces (ISO/IEC 7816-3, T=0).
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

#include "base/Bytes.h"

namespace qel::diagnostics {

struct CardExchange {
  enum class Phase : std::uint8_t { header, procedure, data, status };
  static constexpr std::size_t kHeaderBytes = 5;  // class, instruction, two parameters, length

  Phase phase = Phase::header;
  std::array<std::uint8_t, kHeaderBytes> header{};
  std::size_t headerBytes = 0;  // of it that have come
  std::size_t transferred = 0;  // of the data
  bool toCard = false;          // the data's direction
  bool oneByte = false;         // the card asks for each byte of data
  bool kept = false;            // else the data is counted only
  Bytes data;                   // at most 256
  std::uint8_t firstStatus = 0;
};

}  // namespace qel::diagnostics
