#include "sources/diagnostics/port/FrameReader.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

using test::framed;
using test::joined;
using test::logPacket;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

const Bytes kPacket = logPacket(0xB193, Bytes{0x7E, 1, 0x7D, 2, 0x5E, 0x5D, 0});
const Bytes kOther = logPacket(0xB0C2, Bytes{3});
const Bytes kMark{0x7E};

struct Reading {
  std::vector<Bytes> packets;
  FrameReader::Counts counts;
};

Reading read(ByteView stream, std::size_t piece = SIZE_MAX) {
  Reading reading;
  FrameReader reader;
  while (!stream.empty()) {
    const std::size_t length = std::min(piece, stream.size());
    reader.add(stream.first(length), [&](ByteView packet) {
      reading.packets.emplace_back(packet.begin(), packet.end());
    });
    stream = stream.subspan(length);
  }
  reading.counts = reader.counts();
  return reading;
}

TEST(Hdlc, HasTheCheckSumThatEveryoneHas) {
  const std::string_view digits = "123456789";
  EXPECT_EQ(checkSum(Bytes(digits.begin(), digits.end())), 0x906E);
  EXPECT_EQ(checkSum(kPacket), test::slowCheckSum(kPacket));
  EXPECT_EQ(checkSum({}), test::slowCheckSum({}));
}

TEST(Hdlc, MakesFramesWithEscapes) {
  EXPECT_EQ(frameOf(kPacket), framed(kPacket));
  for (int byte = 0; byte < 256; ++byte) {
    const Bytes packet{0x73, static_cast<std::uint8_t>(byte)};
    EXPECT_EQ(frameOf(packet), framed(packet)) << byte;
  }
}

TEST(FrameReader, GivesPacketsWithoutEscapes) {
  const Reading reading = read(joined({framed(kPacket), framed(kOther)}));
  EXPECT_THAT(reading.packets, ElementsAre(kPacket, kOther));
  EXPECT_EQ(reading.counts.frames, 2U);
  EXPECT_EQ(reading.counts.badFrames, 0U);
  EXPECT_EQ(reading.counts.repaired, 0U);
}

TEST(FrameReader, ReadsTheSameInPiecesOfEverySize) {
  const Bytes stream = joined({framed(kPacket), kMark, framed(kOther, 4), framed(kPacket)});
  for (std::size_t piece = 1; piece < stream.size(); ++piece) {
    EXPECT_THAT(read(stream, piece).packets, ElementsAre(kPacket, kOther, kPacket)) << piece;
  }
}

TEST(FrameReader, TakesMarksInFrontForNothing) {
  const Reading reading = read(joined({kMark, kMark, framed(kPacket), kMark}));
  EXPECT_THAT(reading.packets, ElementsAre(kPacket));
  EXPECT_EQ(reading.counts.badFrames, 0U);
}

TEST(FrameReader, TakesOffASurplusOfFirstBytes) {
  for (const unsigned surplus : {1U, 4U, 7U, 56U, 300U}) {
    const Reading reading = read(joined({framed(kPacket, surplus), framed(kOther)}));
    EXPECT_THAT(reading.packets, ElementsAre(kPacket, kOther)) << surplus;
    EXPECT_EQ(reading.counts.repaired, 1U);
  }
}

TEST(FrameReader, LeavesTwoEqualFirstBytesThatAreRight) {
  Bytes packet = kPacket;
  packet[1] = 0x10;  // sixteen more are waiting at the modem
  EXPECT_THAT(read(framed(packet)).packets, ElementsAre(packet));
}

TEST(FrameReader, TakesNoSurplusOffOtherPackets) {
  const Bytes answer{0x73, 0, 0, 0};
  EXPECT_THAT(read(framed(answer, 3)).packets, IsEmpty());
}

TEST(FrameReader, SkipsAFrameWithAnyBitWrong) {
  const Bytes good = framed(kOther);
  for (std::size_t bit = 0; bit < 8 * (good.size() - 1); ++bit) {
    Bytes bad = good;
    bad[bit / 8] ^= static_cast<std::uint8_t>(1U << bit % 8);
    const Reading reading = read(joined({bad, good}));
    EXPECT_THAT(reading.packets, ElementsAre(kOther)) << bit;
    EXPECT_GE(reading.counts.badFrames, 1U) << bit;
  }
}

TEST(FrameReader, SkipsAFrameThatIsCutAnywhere) {
  const Bytes good = framed(kPacket);
  for (std::size_t length = 1; length + 1 < good.size(); ++length) {
    const Bytes cut(good.begin(), good.begin() + static_cast<std::ptrdiff_t>(length));
    EXPECT_THAT(read(joined({cut, kMark, good})).packets, ElementsAre(kPacket)) << length;
  }
}

TEST(FrameReader, SkipsAnEscapeInFrontOfAMark) {
  const Bytes good = framed(kOther);
  const Reading reading = read(joined({Bytes{0x7D, 0x7E}, Bytes{1, 0x7D, 0x7E}, good}));
  EXPECT_THAT(reading.packets, ElementsAre(kOther));
  EXPECT_EQ(reading.counts.badFrames, 2U);
}

TEST(FrameReader, ReadsTheLongestFrameAndNoLongerOne) {
  const Bytes longest = test::wrapped(1, logPacket(0xB0C0, Bytes(0xFFFF - 12)));
  ASSERT_EQ(longest.size() + kCheckSumBytes, FrameReader::kLongestFrame);
  Bytes longer = longest;
  longer.push_back(0);
  const Reading reading = read(joined({framed(longest), framed(longer), framed(kOther)}));
  EXPECT_THAT(reading.packets, ElementsAre(longest, kOther));
  EXPECT_EQ(reading.counts.badFrames, 1U);
}

TEST(FrameReader, GoesOnBehindAnyNumberOfBytesWithoutAMark) {
  const Bytes noise(70'000, 0x55);
  const Reading reading = read(joined({noise, noise, kMark, framed(kOther)}), 1000);
  EXPECT_THAT(reading.packets, ElementsAre(kOther));
  EXPECT_EQ(reading.counts.badFrames, 1U);
  EXPECT_EQ(reading.counts.bytes, 140'001U + framed(kOther).size());
}

TEST(FrameReader, CountsAFrameThatTheEndCuts) {
  FrameReader reader;
  reader.add(Bytes{0x10, 0}, [](ByteView) { FAIL(); });
  EXPECT_EQ(reader.counts().badFrames, 0U);
  reader.cut();
  reader.cut();
  EXPECT_EQ(reader.counts().badFrames, 1U);
  std::vector<Bytes> packets;
  reader.add(framed(kOther),
             [&](ByteView packet) { packets.emplace_back(packet.begin(), packet.end()); });
  EXPECT_THAT(packets, ElementsAre(kOther));
}

}  // namespace
}  // namespace qel::diagnostics
