#include "sources/diagnostics/requests/Request.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <set>
#include <type_traits>
#include <utility>
#include <vector>

#include "sources/diagnostics/requests/Answers.h"
#include "support/diagnostics/ModemBrain.h"
#include "support/diagnostics/Packets.h"

namespace qel::diagnostics {
namespace {

using test::BodyWriter;
using test::ModemBrain;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using Answer = Request::Answer;

LogRanges someRanges() {
  LogRanges ranges{};
  ranges[1] = 2270;
  ranges[11] = 513;
  return ranges;
}

std::vector<Request> everyRequest() {
  LogMask mask(11, 513);
  mask.enable(0xB0C0);
  return {Request::version(),     Request::build(),     Request::messagesOff(),
          Request::eventsOff(),   Request::eventsOn(),  Request::eventMask(Bytes{1, 2}),
          Request::logsOff(),     Request::logRanges(), Request::setLogMask(mask),
          Request::getLogMask(11)};
}

static_assert(!std::is_constructible_v<Request, Bytes>);
static_assert(!std::is_constructible_v<Request, std::string_view, Bytes>);
static_assert(!std::is_default_constructible_v<Request>);

// Command, and for commands with many meanings the one that is allowed.
TEST(Request, SaysNothingButWhatIsAllowed) {
  const std::set<Bytes> allowed = {
      {0x00},
      {0x7C},
      {0x60, 0},
      {0x60, 1},
      {0x7D, 5, 0, 0, 0, 0, 0, 0},
      {0x82, 0, 0, 0, 16, 0, 1, 2},
      {0x73, 0, 0, 0, 0, 0, 0, 0},
      {0x73, 0, 0, 0, 1, 0, 0, 0},
      {0x73, 0, 0, 0, 4, 0, 0, 0, 11, 0, 0, 0},
  };
  std::set<Bytes> said;
  for (const Request& request : everyRequest()) {
    const Bytes packet(request.packet().begin(), request.packet().end());
    if (packet.size() < 16) said.insert(packet);
  }
  EXPECT_EQ(said, allowed);
}

TEST(Request, IsOneThatAModemTakes) {
  ModemBrain modem;
  for (const Request& request : everyRequest()) {
    const auto answers = modem.answersTo(request.packet());
    ASSERT_THAT(answers, SizeIs(1)) << request.name();
    EXPECT_EQ(request.answerIn(answers[0]), Answer::good) << request.name();
  }
  EXPECT_THAT(modem.forbidden(), IsEmpty());
  EXPECT_TRUE(modem.sends(0xB0C0));
  EXPECT_FALSE(modem.sends(0xB0C1));
}

TEST(Request, KnowsItsAnswerFromThoseOfOthers) {
  ModemBrain modem;
  const auto requests = everyRequest();
  for (const Request& asked : requests) {
    const auto answers = modem.answersTo(asked.packet());
    for (const Request& other : requests) {
      const bool sameCommand = asked.packet()[0] == other.packet()[0];
      const bool sameMeaning = asked.name() == other.name() || asked.packet()[0] == 0x60;
      if (sameCommand && sameMeaning) continue;
      EXPECT_EQ(other.answerIn(answers.at(0)), Answer::none) << asked.name() << other.name();
    }
  }
}

TEST(Request, TakesNoAnswerAboutAnotherEquipment) {
  ModemBrain modem;
  const auto answers = modem.answersTo(Request::getLogMask(11).packet());
  EXPECT_EQ(Request::getLogMask(11).answerIn(answers.at(0)), Answer::good);
  EXPECT_EQ(Request::getLogMask(1).answerIn(answers.at(0)), Answer::none);
}

TEST(Request, KnowsEveryRefusal) {
  for (const unsigned reason : {0x13U, 0x14U, 0x15U, 0x16U, 0x18U, 0x42U, 0x47U}) {
    for (const Request& request : everyRequest()) {
      const Bytes refusal = BodyWriter().u8(reason).bytes(request.packet());
      EXPECT_EQ(request.answerIn(refusal), Answer::refused) << request.name() << reason;
      EXPECT_EQ(request.answerIn(ByteView(refusal).first(1)), Answer::none);
    }
  }
  const Bytes ofAnother = BodyWriter().u8(0x13).bytes(Request::build().packet());
  EXPECT_EQ(Request::logsOff().answerIn(ofAnother), Answer::none);
}

TEST(Request, TakesARefusalThatDoesNotTellTheOperationForAnothers) {
  const Request ranges = Request::logRanges();
  for (std::size_t echoed = 1; echoed <= 8; ++echoed) {
    const ByteView echo = ranges.packet().first(echoed);
    const Answer expected = echoed == 8 ? Answer::refused : Answer::none;
    const Bytes refusal = BodyWriter().u8(0x14).bytes(echo);
    EXPECT_EQ(ranges.answerIn(refusal), expected) << echoed;
  }
  EXPECT_EQ(Request::eventsOn().answerIn(Bytes{0x13, 0x60}), Answer::none);
}

TEST(Request, TakesABadStatusForARefusal) {
  const Bytes answer = BodyWriter().u8(0x73).zeros(3).u32(3).u32(2);
  EXPECT_EQ(Request::setLogMask(LogMask(11, 8)).answerIn(answer), Answer::refused);
}

TEST(Answers, SayNothingWhenTheyAreCut) {
  ModemBrain modem;
  const auto cutAnywhere = [&modem](const Request& request, std::size_t needed, auto read) {
    const Bytes whole = modem.answersTo(request.packet()).at(0);
    EXPECT_TRUE(read(whole)) << request.name();
    for (std::size_t length = 0; length < needed; ++length) {
      const Bytes cut(whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(length));
      EXPECT_FALSE(read(cut)) << request.name() << length;
    }
  };
  const LogMask mask(11, 513);
  cutAnywhere(Request::version(), 47,
              [](const Bytes& answer) { return versionIn(answer).has_value(); });
  cutAnywhere(Request::build(), 12,
              [](const Bytes& answer) { return buildIn(answer).has_value(); });
  cutAnywhere(Request::logRanges(), 76,
              [](const Bytes& answer) { return rangesIn(answer).has_value(); });
  cutAnywhere(Request::getLogMask(11), 85,
              [&](const Bytes& answer) { return saysMask(answer, mask); });
}

TEST(Answers, TellVersionAndBuildInPlainText) {
  ModemBrain modem;
  const auto version = versionIn(modem.answersTo(Request::version().packet()).at(0));
  ASSERT_TRUE(version);
  EXPECT_EQ(version->model, "PSEUDO");
  EXPECT_EQ(version->compiled, "Nov 21 2026 12:34:56");
  const auto build = buildIn(modem.answersTo(Request::build().packet()).at(0));
  ASSERT_TRUE(build);
  EXPECT_EQ(build->build, "MPSS.PSEUDO.1.0-00042");
  EXPECT_EQ(build->model, "Pseudo modem");
  EXPECT_EQ(build->chip, 0x1234U);
}

TEST(Answers, ShowNothingThatCannotBeSeen) {
  const Bytes answer = BodyWriter()
                           .u8(0x7C)
                           .zeros(11)
                           .text(
                               "A\x01\x1b[2J\xff"
                               "B")
                           .bytes(Bytes(200, 'C'));
  const auto build = buildIn(answer);
  ASSERT_TRUE(build);
  EXPECT_EQ(build->build.substr(0, 5), "A[2JB");
  EXPECT_EQ(build->build.size(), 64U);
  EXPECT_EQ(build->model, "");
}

TEST(LogMask, EnablesItemsOfItsEquipmentWithinItsRange) {
  LogMask mask(11, 513);
  EXPECT_TRUE(mask.isEmpty());
  for (const unsigned code : {0xB000U, 0xB009U, 0xB200U, 0xB201U, 0xBFFFU, 0x1009U}) {
    mask.enable(static_cast<std::uint16_t>(code));
  }
  Bytes expected(65);
  expected[0] = 1;
  expected[1] = 2;
  expected[64] = 1;
  EXPECT_EQ(Bytes(mask.bits().begin(), mask.bits().end()), expected);
}

TEST(LogMask, LeavesOutWhatNobodyWantsAndEmptyEquipments) {
  const auto masks = masksOf(someRanges(), [](std::uint16_t code) { return code == 0xB0C0; });
  ASSERT_THAT(masks, SizeIs(1));
  EXPECT_EQ(masks[0].equipment(), 11U);
  EXPECT_EQ(masks[0].items(), 513U);
}

TEST(LogMask, NeverEnablesKeysAndIdentities) {
  LogRanges ranges{};
  ranges.fill(0xFFFFFFFF);  // a modem that says nonsense
  const auto masks = masksOf(ranges, [](std::uint16_t) { return true; });
  ASSERT_THAT(masks, SizeIs(16));
  std::set<unsigned> off;
  for (const LogMask& mask : masks) {
    ASSERT_EQ(mask.items(), kMostItems);
    for (unsigned item = 0; item < kMostItems; ++item) {
      if ((mask.bits()[item / 8] >> item % 8 & 1) == 0) off.insert(mask.equipment() << 12 | item);
    }
  }
  EXPECT_THAT(off, ::testing::ElementsAre(0x7139, 0xB0A3, 0xB0A5, 0xB0B3, 0xB0B5, 0xB0EF, 0xB0F2,
                                          0xB0F3, 0xB0F4));
}

}  // namespace
}  // namespace qel::diagnostics
