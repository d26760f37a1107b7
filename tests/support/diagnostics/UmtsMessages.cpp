#include "support/diagnostics/UmtsMessages.h"

#include <algorithm>

namespace qel::diagnostics::test {
namespace {

constexpr unsigned kBlockBits = 246;
constexpr unsigned kSegmentBits = 222;

// A temporary identity and the area it holds in.
void identity(BitWriter& message) {
  message.number(1, 0, 7).bits(0xCAFE, 32);
  for (const int digit : {2, 6, 2}) message.number(digit, 0, 9);
  message.number(2, 2, 3).number(0, 0, 9).number(7, 0, 9);
  message.bits(0xD92C, 16);
}

// A block of 20 ms: its number and which of the sixteen forms it has.
BitWriter begun(unsigned sfnPrime, unsigned form) {
  return BitWriter().number(sfnPrime, 0, 2047).number(form, 0, 15);
}

Bytes padded(BitWriter& message) {
  while (message.size() < kBlockBits) message.flag(false);
  return message.bytes();
}

// The bits of a block that a segment has.
void stretch(BitWriter& message, const BitWriter& block, unsigned segment, std::size_t count) {
  const Bytes bytes = block.bytes();
  const std::size_t first = std::size_t{segment} * kSegmentBits;
  for (std::size_t i = first; i < first + count; ++i)
    message.flag(i < block.size() && (bytes[i / 8] >> (7 - i % 8) & 1) != 0);
}

}  // namespace

Bytes umtsConnectionRequest(unsigned cause) {
  BitWriter message;
  message.flag(false).number(1, 0, 3);  // no integrity check; which message
  message.flag(false).flag(false);      // neither measurements nor extensions
  identity(message);
  message.number(cause, 0, 31).flag(false);
  return message.bytes();
}

Bytes umtsConnectionReject(unsigned cause) {
  BitWriter message;
  message.flag(false).number(1, 0, 7);
  message.flag(false).flag(false).flag(false);  // of release 3; no extension, no redirection
  identity(message);
  message.number(2, 0, 3).number(cause, 0, 1).number(15, 0, 15);
  return message.bytes();
}

Bytes umtsConnectionRelease(unsigned cause) {
  BitWriter message;
  message.flag(true).bits(0x12345678, 32).number(5, 0, 15).number(15, 0, 31);
  message.flag(false).flag(false);                 // of release 3; no extension
  message.flag(true).flag(false).number(1, 0, 3);  // with a count of repetitions
  message.number(3, 1, 8).number(cause, 0, 7);
  return message.bytes();
}

Bytes umtsConnectionReleaseOfRelease4(unsigned cause) {
  BitWriter message;
  message.flag(false).number(15, 0, 31);
  message.flag(true).number(1, 0, 3).flag(false).flag(false);
  message.flag(false).flag(false).number(cause, 0, 7);
  return message.bytes();
}

BitWriter umtsBlock1(const std::vector<unsigned>& drxCoefficients) {
  BitWriter block;
  block.flag(false).flag(false).flag(false);
  block.number(2, 1, 8).bits(0xD92C, 16);
  block.number(static_cast<std::int64_t>(drxCoefficients.size()), 1, 4);
  bool packet = false;
  for (const unsigned coefficient : drxCoefficients) {
    block.flag(packet).flag(false).number(2, 1, 8).bits(0x0A01, 16);
    block.number(coefficient, 6, 9);
    packet = true;
  }
  return block;
}

BitWriter umtsBlock3(const WrittenUmtsBlock3& written) {
  BitWriter block;
  block.flag(false);                              // no extension
  block.flag(false).bits(written.cellId, 28);     // no block 4
  block.flag(false).flag(false);                  // neither mapping nor a hierarchy of cells
  block.flag(false).flag(true).number(2, 0, 20);  // by Ec/No, with its hysteresis
  block.flag(false);                              // two frequencies
  block.flag(written.intraSearch.has_value()).flag(written.interSearch.has_value());
  block.flag(false).flag(written.gsmSearch.has_value());
  if (written.intraSearch) block.number(*written.intraSearch, -16, 10);
  if (written.interSearch) block.number(*written.interSearch, -16, 10);
  if (written.gsmSearch) {
    block.number(2, 1, 15);  // another technology first
    block.flag(false).flag(true).number(-1, -16, 10).number(0, -16, 10);
    block.flag(false).flag(false).number(*written.gsmSearch, -16, 10).number(0, -16, 10);
  }
  block.number(-18, -24, 0).number(-58, -58, -13);
  block.number(1, 0, 20).number(2, 0, 31).number(24, -50, 33);
  block.flag(false).flag(!written.barred);  // no classes barred
  if (written.barred) block.flag(true).number(3, 0, 7);
  block.flag(true).flag(true);
  return block;
}

BitWriter umtsBlock5(bool downlink, bool uplink, bool fdd) {
  BitWriter block;
  block.flag(false).flag(false).flag(true);  // of what may be left out only the extensions
  block.flag(false).number(-7, -10, 5).flag(!fdd).number(-6, -22, 5);
  block.number(1, 1, 16).bits(0, 5);  // one random access channel, plainly described
  block.flag(false).bits(0xFFFF, 16).number(0, 0, 3).number(0, 0, 15).number(15, 0, 15);
  block.bits(0xFFF, 12).number(3, 1, 32).flag(false).bits(0, 5);
  block.number(1, 1, 16).bits(0, 3);  // one common channel, likewise
  block.flag(false).bits(0, 3).flag(false).flag(false).number(4, 0, 6).number(1, 0, 63);
  block.flag(false).flag(true).flag(true);
  block.flag(false).flag(true);  // extensions, each in the one before
  block.flag(false).flag(true).flag(false).flag(true);
  block.flag(downlink).flag(true);
  if (downlink) block.flag(true);
  block.flag(false).flag(uplink).bits(0, 3);
  return block;
}

BitWriter umtsBlock11(bool fachMeasurementOccasions) {
  BitWriter block;
  block.flag(fachMeasurementOccasions).flag(false).flag(true);
  if (fachMeasurementOccasions) block.flag(false).number(4, 1, 12).flag(true).flag(false);
  return block.bits(0, 40);
}

BitWriter umtsBlock19(unsigned priority, const std::vector<WrittenFrequency>& umts,
                      const std::vector<WrittenFrequency>& gsm,
                      const std::vector<WrittenFrequency>& lte) {
  const auto count = [](const auto& list) { return static_cast<std::int64_t>(list.size()); };
  BitWriter block;
  block.flag(!gsm.empty()).flag(!lte.empty()).flag(false);
  block.flag(!umts.empty()).flag(false);
  block.flag(true).number(priority, 0, 7).number(31, 0, 31).number(5, 0, 7).number(8, 0, 31);
  if (!umts.empty()) block.number(count(umts), 1, 8);
  for (const auto& [channel, itsPriority] : umts) {
    block.flag(true).flag(false).number(channel, 0, 16383).number(itsPriority, 0, 7);
    block.number(4, 0, 31).number(5, 0, 31).number(-18, -24, 0);
  }
  if (!gsm.empty()) block.number(count(gsm), 1, 16);
  for (const auto& [channel, itsPriority] : gsm) {
    block.number(channel, 0, 1023).flag(false).number(0, 0, 3).number(0, 0, 31);
    block.number(itsPriority, 0, 7).number(-50, -58, -13).number(4, 0, 31).number(5, 0, 31);
  }
  if (!lte.empty()) block.number(count(lte), 1, 8);
  for (const auto& [channel, itsPriority] : lte) {
    block.flag(true).flag(true).number(channel, 0, 65535).number(3, 0, 5);
    block.number(itsPriority, 0, 7).number(-61, -70, -22).number(5, 0, 31).number(3, 0, 31);
    block.number(2, 1, 16).number(7, 0, 503).number(503, 0, 503).flag(true);
  }
  return block;
}

Bytes umtsFirstSegment(unsigned sfnPrime, unsigned type, unsigned count, const BitWriter& block) {
  BitWriter message = begun(sfnPrime, 1);
  message.number(type, 0, 31).number(count, 1, 16);
  stretch(message, block, 0, kSegmentBits);
  return padded(message);
}

Bytes umtsNextSegment(unsigned sfnPrime, unsigned type, unsigned index, const BitWriter& block) {
  BitWriter message = begun(sfnPrime, 2);
  message.number(type, 0, 31).number(index, 1, 15);
  stretch(message, block, index, kSegmentBits);
  return padded(message);
}

Bytes umtsLastSegment(unsigned sfnPrime, unsigned type, unsigned index, const BitWriter& block) {
  const std::size_t left = block.size() - std::size_t{index} * kSegmentBits;
  BitWriter message = begun(sfnPrime, 3);
  message.number(type, 0, 31).number(index, 1, 15).number(static_cast<std::int64_t>(left), 1, 214);
  stretch(message, block, index, left);
  return padded(message);
}

Bytes umtsWholeBlock(unsigned sfnPrime, unsigned type, const BitWriter& block) {
  BitWriter message = begun(sfnPrime, 7);
  message.number(1, 1, 16).number(type, 0, 31);
  message.number(static_cast<std::int64_t>(block.size()), 1, 214).append(block);
  return padded(message);
}

}  // namespace qel::diagnostics::test
