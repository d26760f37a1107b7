#include "ui/pages/HappeningsPage.h"

#include <gtest/gtest.h>

#include <set>

#include "support/FixedTimeZone.h"
#include "ui/pages/Scene.h"

namespace qel::testing {
namespace {

const FixedTimeZone kUtc(0, "UTC");

void happen(Scene& scene, std::uint64_t afterMs, HappeningKind kind, std::string text) {
  Happening happening;
  happening.timeMs = kStartMs + afterMs;
  happening.kind = kind;
  happening.text = std::move(text);
  scene.history.add(std::move(happening));
}

using Texts = std::vector<std::string>;

Texts textsOf(const HappeningsPage& page) {
  Texts texts;
  for (const HappeningRow& row : page.rows) texts.push_back(row.text);
  return texts;
}

TEST(HappeningsPage, SaysWhatWillAppearWhileNothingHappened) {
  const Scene scene;
  const HappeningsPage page = happeningsPage(scene.viewpoint(), {}, kUtc);
  EXPECT_TRUE(page.rows.empty());
  EXPECT_TRUE(page.kinds.empty());
  EXPECT_TRUE(page.notice.starts_with("Nothing has happened yet."));
}

TEST(HappeningsPage, HasTheNewestFirstUnderTheirDay) {
  Scene scene;
  constexpr std::uint64_t kHour = 3'600'000;
  happen(scene, 0, HappeningKind::mark, "first");
  happen(scene, 20 * kHour, HappeningKind::mark, "second");
  happen(scene, 50 * kHour + 21'000, HappeningKind::mark, "third");
  scene.at(51 * kHour);
  const HappeningsPage page = happeningsPage(scene.viewpoint(), {}, kUtc);
  EXPECT_EQ(textsOf(page), (Texts{"third", "second", "first"}));
  EXPECT_EQ(page.rows[0].day, "Today");
  EXPECT_EQ(page.rows[0].time, "10:00:21");
  EXPECT_EQ(page.rows[1].day, "Yesterday");
  EXPECT_EQ(page.rows[2].day, "Friday, 15 January");
  EXPECT_EQ(page.rows[0].spoken, "10:00:21, Mark: third");
  EXPECT_EQ(happeningsPage(scene.viewpoint(false), {}, kUtc).rows[0].day,
            "Sunday, 17 January 2027");
}

TEST(HappeningsPage, NamesTheRecordThatToldIt) {
  Scene scene;
  scene.cell({});
  const HappeningsPage page = happeningsPage(scene.viewpoint(), {}, kUtc);
  ASSERT_FALSE(page.rows.empty());
  EXPECT_EQ(page.rows.back().record, "KCellularLteScellInfo");
  EXPECT_EQ(page.rows.back().technology, "LTE");
}

TEST(HappeningsPage, ShowsChosenKindsAndCountsAll) {
  Scene scene;
  happen(scene, 0, HappeningKind::mark, "mark");
  happen(scene, 1, HappeningKind::gap, "gap");
  happen(scene, 2, HappeningKind::gap, "gap again");
  scene.at(10);
  HappeningsFilter filter;
  filter.kinds = {HappeningKind::gap};
  const HappeningsPage page = happeningsPage(scene.viewpoint(), filter, kUtc);
  EXPECT_EQ(textsOf(page), (Texts{"gap again", "gap"}));
  EXPECT_EQ(page.kinds, (std::vector<KindChoice>{{HappeningKind::gap, "Gap", 2, true},
                                                 {HappeningKind::mark, "Mark", 1, false}}));
  filter.kinds = {HappeningKind::bearer};
  EXPECT_EQ(happeningsPage(scene.viewpoint(), filter, kUtc).notice,
            "Nothing of the chosen kinds has happened.");
}

TEST(HappeningsPage, KeepsTheIdentityOfARow) {
  Scene scene;
  happen(scene, 0, HappeningKind::mark, "one");
  happen(scene, 0, HappeningKind::mark, "two");
  const auto before = happeningsPage(scene.viewpoint(), {}, kUtc).rows;
  happen(scene, 0, HappeningKind::mark, "three");
  happen(scene, 5, HappeningKind::gap, "four");
  scene.at(10);
  const auto after = happeningsPage(scene.viewpoint(), {}, kUtc).rows;
  ASSERT_EQ(after.size(), 4U);
  EXPECT_EQ(after[3].id, before[1].id);
  EXPECT_EQ(after[2].id, before[0].id);
  EXPECT_NE(after[1].id, after[2].id);
}

TEST(HappeningsPage, GivesEveryRowAnIdentityOfItsOwnWhenTheClockGoesBack) {
  Scene scene;
  happen(scene, 5, HappeningKind::mark, "one");
  happen(scene, 3, HappeningKind::mark, "two");
  happen(scene, 5, HappeningKind::mark, "three");
  scene.at(10);
  std::set<std::string> ids;
  for (const HappeningRow& row : happeningsPage(scene.viewpoint(), {}, kUtc).rows) {
    ids.insert(row.id);
  }
  EXPECT_EQ(ids.size(), 3U);
}

TEST(HappeningsPage, CountsTheOlderOnesThatItLeavesOut) {
  Scene scene;
  for (std::uint64_t i = 0; i < 5; ++i) happen(scene, i, HappeningKind::mark, std::to_string(i));
  scene.at(10);
  HappeningsFilter filter;
  filter.most = 2;
  const HappeningsPage page = happeningsPage(scene.viewpoint(), filter, kUtc);
  EXPECT_EQ(textsOf(page), (Texts{"4", "3"}));
  EXPECT_EQ(page.older, "3 older ones are not shown");
}

TEST(HappeningsPage, HidesWhatComesAfterTheMoment) {
  Scene scene;
  happen(scene, 0, HappeningKind::mark, "before");
  happen(scene, 1000, HappeningKind::mark, "after");
  scene.at(500);
  EXPECT_EQ(textsOf(happeningsPage(scene.viewpoint(false), {}, kUtc)), Texts{"before"});
}

}  // namespace
}  // namespace qel::testing
