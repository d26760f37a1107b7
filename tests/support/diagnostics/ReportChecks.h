// The heart with packets put into it, and its reports as messages.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <random>
#include <vector>

#include "sources/diagnostics/DiagnosticsReader.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics::test {

class Heart {
 public:
  // What the packet told of, in that order. The body lies in memory of just its size.
  std::vector<std::uint32_t> take(std::uint16_t code, const Bytes& body, unsigned radio = 0) {
    const Told& told = _reader.take(LogPacket{code, timeMs, radio, Bytes(body)});
    return {told.begin(), told.end()};
  }

  // Of a metric that something is known of.
  template <class Message>
  Message report(std::uint32_t metric) const {
    const auto payload = _reader.report(metric, timeMs);
    EXPECT_TRUE(payload) << metric;
    const auto message = Message::initWithData(payload.value_or(Bytes()));
    EXPECT_TRUE(message) << metric;
    return message ? *message : Message();
  }

  bool knows(std::uint32_t metric) const { return _reader.report(metric, timeMs).has_value(); }
  std::optional<Bytes> payload(std::uint32_t metric) const {
    return _reader.report(metric, timeMs);
  }

  const Picture& picture() const { return _reader.picture(); }
  PacketCounts::Row counts() const { return _reader.counts().total(); }

  std::uint64_t timeMs = kSomeTimeMs;

 private:
  DiagnosticsReader _reader;
};

// Reads the log cut off at every length, then with a thousand damages. Nothing may be read past
// the end; the metrics must be buildable afterwards.
inline void mistreat(std::uint16_t code, const Bytes& body,
                     const std::vector<std::uint32_t>& metrics) {
  Heart heart;
  for (std::size_t length = 0; length <= body.size(); ++length) {
    heart.take(code, Bytes(body.begin(), body.begin() + static_cast<std::ptrdiff_t>(length)));
  }
  std::mt19937 random(code);
  for (int i = 0; i < 1000; ++i) {
    Bytes damaged = body;
    for (int flips = 1 + i % 4; flips > 0; --flips) {
      damaged[random() % damaged.size()] ^= static_cast<std::uint8_t>(1U << random() % 8);
    }
    damaged.resize(1 + random() % damaged.size());
    heart.take(code, damaged);
    for (const std::uint32_t metric : metrics) heart.payload(metric);
  }
  EXPECT_EQ(heart.counts().all(), body.size() + 1 + 1000);
  EXPECT_GT(heart.counts().understood, 0U);
}

}  // namespace qel::diagnostics::test
