#include "ui/pages/RecordingsPage.h"

#include <gtest/gtest.h>

#include "support/RecordedLines.h"

namespace qel::testing {
namespace {

using Names = std::vector<std::string>;

class RecordingsPageTest : public ::testing::Test {
 protected:
  RecordingsPageTest() {
    ::setenv("TZ", "UTC0", 1);
    folder.file("2026-01-01 10.00.00.jsonl", lineOf(lteCell(1'500'000'000'000, 1)));
    folder.file("2026-01-02 10.00.00.jsonl",
                lineOf(lteCell(1'500'000'000'000, 1)) + lineOf(lteCell(1'500'000'754'000, 2)));
    folder.file("notes.txt", "of somebody");
  }
  Names names(const RecordingsPage& page) const {
    Names names;
    for (const RecordingRow& row : page.view().rows) names.push_back(row.name);
    return names;
  }

  TemporaryFolder folder;
  const std::string older = "2026-01-01 10.00.00.jsonl";
  const std::string newer = "2026-01-02 10.00.00.jsonl";
};

TEST_F(RecordingsPageTest, listsRecordingsNewestFirstWithWhatIsInThem) {
  RecordingsPage page{RecordingsFolder(folder.path())};
  page.refresh();
  EXPECT_EQ(names(page), (Names{newer, older}));
  EXPECT_EQ(page.view().rows[0].length, "") << "not known yet";
  while (page.work()) {
  }
  const RecordingRow& row = page.view().rows[0];
  EXPECT_EQ(row.title, "2017-07-14 02:40:00 UTC");
  EXPECT_EQ(row.length, "0:12:34");
  EXPECT_EQ(row.cells, "2 cells");
  EXPECT_EQ(row.fault, "");
  EXPECT_EQ(page.view().rows[1].cells, "1 cell");
  EXPECT_TRUE(page.view().totalText.starts_with("2 recordings, ")) << page.view().totalText;
  EXPECT_EQ(page.view().emptyText, "");
}

// Once the title of a small file waited until a large one was read.
TEST_F(RecordingsPageTest, tellsWhenEachWasBegunBeforeOneIsRead) {
  std::string many;
  for (int i = 0; i < 10'000; ++i) many += lineOf(lteCell(1'500'000'000'000, 1));
  folder.file(newer, many);
  RecordingsPage page{RecordingsFolder(folder.path())};
  page.refresh();
  page.work();
  page.work();
  for (const RecordingRow& row : page.view().rows) {
    EXPECT_EQ(row.title, "2017-07-14 02:40:00 UTC");
    EXPECT_EQ(row.length, "");
  }
}

TEST_F(RecordingsPageTest, saysThatThereIsNone) {
  const TemporaryFolder empty;
  RecordingsPage page{RecordingsFolder(empty.path() + "/not/there")};
  page.refresh();
  EXPECT_FALSE(page.work());
  EXPECT_EQ(page.view().emptyText, "Nothing has been recorded yet");
}

TEST_F(RecordingsPageTest, deletesForGoodOnlyWithTheNextOne) {
  RecordingsPage page{RecordingsFolder(folder.path())};
  page.refresh();
  page.remove(newer);
  EXPECT_EQ(names(page), Names{older});
  EXPECT_EQ(page.view().undoText, newer + " deleted");
  page.undo();
  EXPECT_EQ(names(page), (Names{newer, older}));
  EXPECT_EQ(page.view().undoText, "");
  page.remove(newer);
  page.remove(older);
  EXPECT_EQ(page.view().undoText, older + " deleted");
  page.undo();
  EXPECT_EQ(names(page), Names{older});
  page.remove(older);
  page.forget();
  page.undo();
  EXPECT_EQ(names(page), Names{});
  EXPECT_FALSE(folder.has("." + older + ".deleted"));
  EXPECT_TRUE(folder.has("notes.txt"));
}

TEST_F(RecordingsPageTest, finishesAfterADayWhatAnEndedViewerDeleted) {
  struct LaterClock final : Clock {
    std::uint64_t nowMs() const override { return systemClock().nowMs() + 25ULL * 60 * 60 * 1000; }
  };
  folder.file("." + older + ".deleted", "");
  { const RecordingsPage page{RecordingsFolder(folder.path())}; }
  EXPECT_TRUE(folder.has("." + older + ".deleted"));
  const RecordingsPage page{RecordingsFolder(folder.path()), LaterClock()};
  EXPECT_FALSE(folder.has("." + older + ".deleted"));
}

TEST_F(RecordingsPageTest, leavesWhatAnotherViewerCanUndo) {
  RecordingsPage page{RecordingsFolder(folder.path())};
  page.refresh();
  page.remove(newer);
  {
    RecordingsPage other{RecordingsFolder(folder.path())};
    other.refresh();
    other.remove(older);
    other.forget();
  }
  page.undo();
  EXPECT_EQ(page.view().error, "");
  EXPECT_EQ(names(page), Names{newer});
}

TEST_F(RecordingsPageTest, readsAFileAnewThatChangesMeanwhile) {
  RecordingsPage page{RecordingsFolder(folder.path())};
  const std::string lines = lineOf(lteCell(1'500'000'000'000, 1));
  std::string many;
  for (int i = 0; i < 3000; ++i) many += lines;
  folder.file(newer, many);
  page.refresh();
  EXPECT_TRUE(page.work()) << "not yet all of it";
  folder.file(newer, lines + lineOf(lteCell(1'500'000'060'000, 2)));
  page.refresh();
  while (page.work()) {
  }
  EXPECT_EQ(page.view().rows[0].length, "0:01:00");
  EXPECT_EQ(page.view().rows[0].cells, "2 cells");
}

TEST_F(RecordingsPageTest, leavesTheOneBeingRecordedAlone) {
  RecordingsPage page{RecordingsFolder(folder.path())};
  page.refresh(newer);
  EXPECT_TRUE(page.view().rows[0].isGrowing);
  page.remove(newer);
  EXPECT_EQ(names(page), (Names{newer, older}));
  while (page.work()) {
  }
  EXPECT_EQ(page.view().rows[0].length, "");
  page.refresh();
  while (page.work()) {
  }
  EXPECT_EQ(page.view().rows[0].length, "0:12:34");
}

TEST_F(RecordingsPageTest, saysWhatIsWrongWithAFile) {
  folder.file("empty.jsonl", "");
  folder.file("damaged.jsonl.gz", "\x1f\x8b and so on");
  RecordingsPage page{RecordingsFolder(folder.path())};
  page.refresh();
  while (page.work()) {
  }
  for (const RecordingRow& row : page.view().rows) {
    const bool isGood = row.name == newer || row.name == older;
    EXPECT_EQ(row.fault.empty(), isGood) << row.name << ": " << row.fault;
  }
}

TEST(RecordingsFolder, beginsNoMoreThanItMayHold) {
  const TemporaryFolder folder;
  RecordingsFolder::Limits limits;
  limits.files = 2;
  limits.bytes = 1000;
  limits.leastForOne = 100;
  const RecordingsFolder recordings(folder.path() + "/own", limits);
  std::string why;
  ::setenv("TZ", "UTC0", 1);
  EXPECT_EQ(recordings.nameForNew(1'500'000'000'000, why), "2017-07-14 02.40.00.jsonl.gz");
  folder.file("own/2017-07-14 02.40.00.jsonl.gz", std::string(901, 'x'));
  EXPECT_EQ(recordings.nameForNew(1'500'000'000'000, why), std::nullopt);
  EXPECT_EQ(why, "Recordings take up the 1.0 kB that they may: delete one first");
  folder.file("own/2017-07-14 02.40.00.jsonl.gz", "");
  EXPECT_EQ(recordings.nameForNew(1'500'000'000'000, why), "2017-07-14 02.40.00 (2).jsonl.gz");
  folder.file("own/b.jsonl", "");
  EXPECT_EQ(recordings.nameForNew(1'500'000'000'000, why), std::nullopt);
  EXPECT_EQ(why, "2 recordings are kept, and no more than 2: delete one first");
}

TEST(RecordingsFolder, touchesNothingElse) {
  const TemporaryFolder folder;
  folder.file("notes.txt", "");
  const RecordingsFolder recordings(folder.path());
  for (const std::string& name : {std::string("notes.txt"), std::string("../a.jsonl"),
                                  std::string(".hidden.jsonl"), std::string()}) {
    EXPECT_NE(recordings.hide(name), "") << name;
    EXPECT_NE(recordings.restore(name), "") << name;
    recordings.drop(name);
  }
  EXPECT_TRUE(folder.has("notes.txt"));
}

TEST(RecordingsFolder, isWhereTheUsersDataIs) {
  ::setenv("XDG_DATA_HOME", "/data", 1);
  EXPECT_EQ(RecordingsFolder::usualPath(), "/data/qelwatch/recordings");
  ::setenv("XDG_DATA_HOME", "relative", 1);
  ::setenv("HOME", "/home/somebody", 1);
  EXPECT_EQ(RecordingsFolder::usualPath(), "/home/somebody/.local/share/qelwatch/recordings");
  ::unsetenv("HOME");
  EXPECT_EQ(RecordingsFolder::usualPath(), "");
  std::string why;
  EXPECT_EQ(RecordingsFolder("").nameForNew(0, why), std::nullopt);
  EXPECT_NE(why, "");
}

}  // namespace
}  // namespace qel::testing
