// What is read of a SIM card while the modem reads it, and what is never kept.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>

#include "messages/nas.h"
#include "messages/sim.h"
#include "sources/Metrics.h"
#include "sources/diagnostics/sim/KeptFiles.h"
#include "support/diagnostics/CardTrace.h"
#include "support/diagnostics/ReportChecks.h"

namespace qel::diagnostics {
namespace {

using test::cardLog;
using test::CardTrace;
using test::Heart;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::Pair;
using ::testing::UnorderedElementsAre;

constexpr std::uint16_t kLog = 0x1098;

// 001010000000000: of nobody.
const Bytes kImsi{8, 0x09, 0x10, 0x10, 0, 0, 0, 0, 0};
const Bytes kSecret{0xDE, 0xAD, 0xBE, 0xEF, 0xDE, 0xAD, 0xBE, 0xEF};

std::size_t itemBytes(std::uint8_t item) { return item == 0x01 ? 9 : 2; }

// The trace in logs of at most `most` bytes.
std::vector<std::uint32_t> play(Heart& heart, const CardTrace& trace, std::size_t most = 250) {
  std::vector<std::uint32_t> told;
  const Bytes& items = trace.items();
  for (std::size_t begin = 0; begin < items.size();) {
    std::size_t end = begin;
    while (end < items.size() &&
           end + itemBytes(items[end]) - begin <= std::max<std::size_t>(most, 9)) {
      end += itemBytes(items[end]);
    }
    const Bytes piece(items.begin() + static_cast<std::ptrdiff_t>(begin),
                      items.begin() + static_cast<std::ptrdiff_t>(end));
    for (const std::uint32_t metric : heart.take(kLog, cardLog(piece))) told.push_back(metric);
    begin = end;
  }
  return told;
}

std::map<std::uint32_t, Bytes> filesOf(const Heart& heart) {
  std::map<std::uint32_t, Bytes> files;
  if (!heart.knows(metric::kSimFiles)) return files;
  const auto report = heart.report<KCellularSimCardFiles>(metric::kSimFiles);
  for (const auto& file : report.efLists()) {
    files[file->efId()] = file->content().value_or(Bytes());
  }
  return files;
}

bool holdsSecret(const Bytes& bytes) {
  return std::search(bytes.begin(), bytes.end(), kSecret.begin(), kSecret.end()) != bytes.end();
}

// Nowhere in all that is known of the card, what is under way included.
bool holdsSecret(const Heart& heart) {
  const SimPicture& sim = heart.picture().sim;
  const auto inFile = [](const SimFile& file) { return holdsSecret(file.content); };
  return holdsSecret(sim.exchange.data) || holdsSecret(heart.picture().nas.common.imsi) ||
         std::any_of(sim.files.begin(), sim.files.end(), inFile);
}

TEST(CardTrace, GivesFilesThatAreSelectedAndRead) {
  CardTrace trace;
  trace.reset().select(0x3F00).select(0x2FE2).read(Bytes(10, 0x98));
  trace.selectUsim().select(0x6F07).read(kImsi).select(0x6F7B).read(Bytes(12, 0xFF));
  Heart heart;
  EXPECT_THAT(play(heart, trace), Contains(metric::kSimFiles));
  EXPECT_THAT(filesOf(heart),
              UnorderedElementsAre(Pair(0x2FE2, Bytes(10, 0x98)), Pair(0x6F07, kImsi),
                                   Pair(0x6F7B, Bytes(12, 0xFF))));
}

TEST(CardTrace, IsTheSameInPiecesOfEverySize) {
  CardTrace trace;
  trace.reset().selectUsim().select(0x6F07).read(kImsi).select(0x6FAD).read({0, 0, 0, 2});
  for (std::size_t most = 9; most < 200; ++most) {
    Heart heart;
    play(heart, trace, most);
    EXPECT_THAT(filesOf(heart),
                UnorderedElementsAre(Pair(0x6F07, kImsi), Pair(0x6FAD, Bytes{0, 0, 0, 2})))
        << most;
  }
}

TEST(CardTrace, TellsTheSubscriberOnce) {
  CardTrace trace;
  trace.selectUsim().select(0x6F07).read(kImsi);
  Heart heart;
  EXPECT_THAT(play(heart, trace), ElementsAre(metric::kSimFiles, metric::kMmCommonInfo));
  EXPECT_EQ(heart.report<KCellularMmCommonInfo>(metric::kMmCommonInfo).imsi(), kImsi);
}

TEST(CardTrace, TakesNoSubscriberFromAFileThatIsNone) {
  for (const Bytes& content : {Bytes(9, 0xFF), Bytes{0, 9, 1, 1, 1, 1, 1, 1, 1},
                               Bytes{8, 0x0A, 1, 1, 1, 1, 1, 1, 1}, Bytes{8, 9, 1}}) {
    CardTrace trace;
    trace.selectUsim().select(0x6F07).read(content);
    Heart heart;
    EXPECT_THAT(play(heart, trace), ElementsAre(metric::kSimFiles));
    EXPECT_FALSE(heart.knows(metric::kMmCommonInfo));
  }
}

TEST(CardTrace, KnowsShortNames) {
  CardTrace trace;
  trace.reset().ask({0, 0xB0, 0x82, 0}, Bytes(10, 0x11));  // in the root: the card's number
  trace.selectUsim().ask({0, 0xB0, 0x87, 0}, kImsi).ask({0, 0xB0, 0x8B, 0}, Bytes(11, 1));
  trace.ask({0, 0xB0, 0x8C, 0}, Bytes(14, 2)).ask({0, 0xB0, 0x83, 0}, Bytes(4, 3));
  trace.ask({0, 0xB2, 1, 0x0C}, {0x11, 0xF2, 0xFF}).ask({0, 0xB2, 2, 0x0C}, {0x19, 0xF1, 0xFF});
  Heart heart;
  play(heart, trace);
  EXPECT_THAT(filesOf(heart),
              UnorderedElementsAre(Pair(0x2FE2, Bytes(10, 0x11)), Pair(0x6F07, kImsi),
                                   Pair(0x6F7E, Bytes(11, 1)), Pair(0x6F73, Bytes(14, 2)),
                                   Pair(0x6FAD, Bytes(4, 3)),
                                   Pair(0x6FB7, Bytes{0x11, 0xF2, 0xFF, 0x19, 0xF1, 0xFF})));
}

TEST(CardTrace, FollowsPaths) {
  CardTrace trace;
  trace.selectUsim();
  trace.send({0, 0xA4, 0x08, 0x04}, {0x7F, 0xFF, 0x6F, 0xAD}).read({1, 2, 3, 4});
  trace.send({0, 0xA4, 0x08, 0x04}, {0x2F, 0x05}).read({'e', 'n'});
  trace.send({0, 0xA4, 0x08, 0x04}, {0x7F, 0x10, 0x6F, 0x7B}).read(kSecret);
  Heart heart;
  play(heart, trace);
  EXPECT_THAT(filesOf(heart),
              UnorderedElementsAre(Pair(0x6FAD, Bytes{1, 2, 3, 4}), Pair(0x2F05, Bytes{'e', 'n'})));
}

TEST(CardTrace, PutsPiecesOfAFileTogether) {
  CardTrace trace;
  trace.selectUsim().select(0x6F62);
  trace.read(Bytes(200, 1)).read(Bytes(50, 2), 0, 200).read(Bytes(5, 3), 0, 300);
  Heart heart;
  play(heart, trace);
  const Bytes content = filesOf(heart)[0x6F62];
  EXPECT_EQ(content.size(), 250U);
  EXPECT_EQ(content[199], 1);
  EXPECT_EQ(content[200], 2);
}

TEST(CardTrace, StopsAtFilesThatAreTooLong) {
  CardTrace trace;
  trace.selectUsim().select(0x6F62);
  for (std::uint16_t offset = 0; offset < 2000; offset = static_cast<std::uint16_t>(offset + 200)) {
    trace.read(Bytes(200, 1), 0, offset);
  }
  Heart heart;
  play(heart, trace);
  EXPECT_EQ(filesOf(heart)[0x6F62].size(), 1000U);
}

TEST(CardTrace, ReadsOldCardsToo) {
  CardTrace trace;
  trace.reset().select(0x7F20, 0xA0).select(0x6F07, 0xA0).read(kImsi, 0xA0);
  Heart heart;
  play(heart, trace);
  EXPECT_THAT(filesOf(heart), ElementsAre(Pair(0x6F07, kImsi)));
}

TEST(CardTrace, TakesDataByteByByteWhereTheCardWantsItSo) {
  CardTrace trace;
  trace.selectUsim().select(0x6FAD).toCard({0, 0xB0, 0, 0, 4}).fromCard({0x60});
  for (const std::uint8_t byte : Bytes{9, 8, 7, 6}) trace.fromCard({0x4F, byte});
  trace.fromCard({0x90, 0x00});
  Heart heart;
  play(heart, trace);
  EXPECT_THAT(filesOf(heart), ElementsAre(Pair(0x6FAD, Bytes{9, 8, 7, 6})));
}

TEST(CardTrace, HasNothingOfReadsThatFail) {
  CardTrace trace;
  trace.selectUsim().select(0x6FAD).ask({0, 0xB0, 0, 0}, {1, 2}, 0x6282);
  trace.toCard({0, 0xB0, 0, 0, 9}).fromCard({0x6C, 0x04});
  Heart heart;
  EXPECT_THAT(play(heart, trace), IsEmpty());
  EXPECT_FALSE(heart.knows(metric::kSimFiles));
}

TEST(CardTrace, KeepsNothingOfOtherApplications) {
  CardTrace trace;
  const Bytes multimedia{0xA0, 0, 0, 0, 0x87, 0x10, 0x04};
  trace.selectUsim().toCard({}).send({1, 0xA4, 0x04, 0x04}, multimedia);
  trace.select(0x6F07, 1).read(kSecret, 1).ask({1, 0xB0, 0x87, 0}, kSecret);
  trace.select(0x6F07).read(kImsi);
  Heart heart;
  play(heart, trace);
  EXPECT_THAT(filesOf(heart), ElementsAre(Pair(0x6F07, kImsi)));
  EXPECT_FALSE(holdsSecret(heart));
}

TEST(CardTrace, ForgetsWhatWasOnAChannelThatIsOpenedAnew) {
  CardTrace trace;
  trace.selectUsim(1).select(0x6FAD, 1).ask({0, 0x70, 0, 0}, {1});
  trace.read(kSecret, 1).ask({1, 0xB0, 0x87, 0}, kSecret);
  Heart heart;
  EXPECT_THAT(play(heart, trace), IsEmpty());
  EXPECT_FALSE(holdsSecret(heart));
}

// Keys, by number and by short name; what authentication says and hears; secret numbers of the
// owner; names, numbers and messages.
TEST(CardTrace, NeverKeepsSecrets) {
  std::vector<CardTrace> traces;
  for (const std::uint16_t file :
       std::initializer_list<std::uint16_t>{0x6F08, 0x6F09, 0x6FE4, 0x6F20, 0x6F52, 0x4F20, 0x4F52,
                                            0x4F01, 0x4F03, 0x6F40, 0x6F3A, 0x6F3C, 0x6F3B}) {
    for (const std::uint8_t kind : Bytes{0x00, 0xA0}) {
      CardTrace trace;
      trace.selectUsim().select(0x7F20, 0xA0).select(file, kind).read(kSecret, kind);
      trace.ask({kind, 0xB2, 1, 4}, kSecret);
      traces.push_back(trace);
    }
    CardTrace trace;
    trace.selectUsim().select(file).read(kSecret);
    trace.send({0, 0xA4, 0x08, 0x04}, {0x7F, 0xFF, static_cast<std::uint8_t>(file >> 8),
                                       static_cast<std::uint8_t>(file & 0xFF)});
    traces.push_back(trace.read(kSecret));
  }
  for (std::uint8_t name = 1; name < 0x20; ++name) {
    if (fileOfUsim(name) != 0) continue;
    CardTrace trace;
    trace.selectUsim().ask({0, 0xB0, static_cast<std::uint8_t>(0x80 | name), 0}, kSecret);
    traces.push_back(trace);
  }
  for (const std::uint8_t instruction :
       Bytes{0x88, 0x89, 0x20, 0x24, 0x2C, 0xC0, 0xD6, 0xDC, 0x10, 0x12, 0x14, 0xC2}) {
    CardTrace sending;
    sending.selectUsim().select(0x6F07).send({0, instruction, 0, 0x81}, kSecret, 0x6108);
    traces.push_back(sending);
    CardTrace asking;
    asking.selectUsim().select(0x6F07).ask({0, instruction, 0, 0x81}, kSecret);
    traces.push_back(asking);
  }
  for (const CardTrace& trace : traces) {
    const Bytes& items = trace.items();
    Heart heart;
    for (std::size_t i = 0; i < items.size(); i += itemBytes(items[i])) {
      const auto begin = items.begin() + static_cast<std::ptrdiff_t>(i);
      const Bytes item(begin, begin + static_cast<std::ptrdiff_t>(itemBytes(items[i])));
      EXPECT_THAT(heart.take(kLog, cardLog(item)), IsEmpty());
      ASSERT_FALSE(holdsSecret(heart)) << hexText(items);
      ASSERT_TRUE(heart.picture().sim.files.empty()) << hexText(items);
    }
  }
}

TEST(CardTrace, DoesNotTakeAnotherFileForTheOneBeforeWhoseSelectionWasLost) {
  CardTrace before;
  before.selectUsim().select(0x6F07).read(kImsi);
  CardTrace secret;
  secret.read(kSecret);
  Heart heart;
  play(heart, before);
  play(heart, secret);
  EXPECT_FALSE(holdsSecret(heart));
  CardTrace selected;
  selected.select(0x6F7B).toCard({0, 0xA4, 0, 4});
  play(heart, selected);
  heart.take(kLog, Bytes{9, 0x10});
  play(heart, secret);
  EXPECT_FALSE(holdsSecret(heart));
}

// A status is asked for, a file is not found: whatever lies between may hide a selection.
TEST(CardTrace, TakesAFileOnlyRightBehindItsSelection) {
  CardTrace status;
  status.selectUsim().select(0x6F07).ask({0x80, 0xF2, 0, 0}, {1}).read(kSecret);
  CardTrace missing;
  missing.selectUsim().select(0x6F07).send({0, 0xA4, 0, 4}, {0x6F, 0x7B}, 0x6A82).read(kSecret);
  for (const CardTrace& trace : {status, missing}) {
    Heart heart;
    EXPECT_THAT(play(heart, trace), IsEmpty());
    EXPECT_FALSE(holdsSecret(heart));
  }
  CardTrace described;
  described.selectUsim().select(0x6F07).ask({0, 0xC0, 0, 0}, {0x62, 0}).read(kImsi);
  Heart heart;
  play(heart, described);
  EXPECT_THAT(filesOf(heart), ElementsAre(Pair(0x6F07, kImsi)));
}

TEST(CardTrace, TakesAnotherCardForAnother) {
  CardTrace first;
  first.reset().select(0x2FE2).read(Bytes(10, 1)).selectUsim().select(0x6F07).read(kImsi);
  CardTrace second;
  second.reset().select(0x2FE2).read(Bytes(10, 2));
  Heart heart;
  play(heart, first);
  play(heart, first);
  EXPECT_TRUE(heart.knows(metric::kMmCommonInfo));
  play(heart, second);
  EXPECT_THAT(filesOf(heart), ElementsAre(Pair(0x2FE2, Bytes(10, 2))));
  EXPECT_FALSE(heart.knows(metric::kMmCommonInfo));
}

TEST(CardTrace, StaysSmallWhateverIsSaid) {
  CardTrace trace;
  trace.selectUsim().select(0x6FAD).toCard({0, 0xB0, 0, 0, 3});
  for (int i = 0; i < 50; ++i) trace.fromCard({0xB0, 1, 2, 3});
  Heart heart;
  play(heart, trace);
  EXPECT_LE(heart.picture().sim.exchange.data.size(), 256U);
}

TEST(CardTrace, FindsItsWayAgainAfterALoss) {
  CardTrace trace;
  trace.selectUsim().select(0x6F07).toCard({0, 0xB0, 0, 0, 9}).fromCard({0xB0, 1, 2});
  trace.select(0x6F07).read(kImsi);
  Heart heart;
  play(heart, trace);
  EXPECT_THAT(filesOf(heart), ElementsAre(Pair(0x6F07, kImsi)));
}

TEST(CardTrace, IsDamagedWhereAnItemIsNone) {
  Heart heart;
  for (const Bytes& log :
       {Bytes{}, Bytes{3, 0x10, 1}, Bytes{1, 0x10}, Bytes{2, 0x11, 1}, Bytes{3, 0x01, 1, 2}}) {
    heart.take(kLog, log);
  }
  EXPECT_EQ(heart.counts().damaged, 5U);
}

TEST(CardTrace, StandsEveryDamage) {
  CardTrace trace;
  trace.reset().selectUsim().select(0x6F07).read(kImsi);
  const Bytes log = cardLog(trace.items());
  ASSERT_LT(trace.items().size(), 256U);
  test::mistreat(kLog, log, {metric::kSimFiles, metric::kMmCommonInfo});
}

}  // namespace
}  // namespace qel::diagnostics
