// Codes of networks, with all their digits.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace qel {

// A public land mobile network (23.003, clause 2.2): three digits, and two or three.
struct Network {
  std::string mcc;
  std::string mnc;

  // "262-01"
  std::string text() const { return mcc + '-' + mnc; }
  friend bool operator==(const Network&, const Network&) = default;
};

// From the numbers of a report. Without a number of digits, or with another one than 2 and 3, the
// network code has as many as it needs: three from 100 up and in countries that have no others
// (ITU-T E.212: Canada, the United States, Mexico), else two. Nothing for numbers beyond 999.
std::optional<Network> networkOf(std::uint32_t mcc, std::uint32_t mnc,
                                 std::optional<std::uint32_t> mncDigits = {});

// From and to the three bytes of 24.008, clause 10.5.1.3. Nothing for another number of bytes or
// what are no digits.
std::optional<Network> networkOfBytes(ByteView bytes);
std::optional<Bytes> bytesOf(const Network& network);

}  // namespace qel
