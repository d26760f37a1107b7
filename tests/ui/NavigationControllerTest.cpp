#include "ui/kit/NavigationController.h"

#include <gtest/gtest.h>

#include "ui/Tables.h"
#include "ui/kit/Storyboard.h"

namespace qel {
namespace {

using testing::FakeTable;
using testing::makeScreen;

// Every field opens another table.
class EndlessStoryboard final : public Storyboard {
 public:
  std::string destination = "FakeTable";

  std::string destinationOfCell(std::string_view cellIdentifier) const override {
    return cellIdentifier == "SecondClickView" ? destination : "";
  }
  std::shared_ptr<TableViewController> makeScreen(std::string_view className) const override {
    return className == "FakeTable" ? testing::makeScreen<FakeTable>() : nullptr;
  }
};

class NavigationControllerTest : public ::testing::Test {
 protected:
  NavigationControllerTest() { root->sections = {{std::nullopt, {{"LTE", "4G"}}}}; }

  std::shared_ptr<FakeTable> root = makeScreen<FakeTable>();
  std::shared_ptr<NavigationController> navigation = std::make_shared<NavigationController>(root);
  EndlessStoryboard storyboard;
};

TEST_F(NavigationControllerTest, startsWithItsRootAndNeverLosesIt) {
  EXPECT_EQ(navigation->topViewController(), root);
  EXPECT_EQ(navigation->popViewController(), nullptr);
  EXPECT_EQ(navigation->viewControllers().size(), 1U);
}

TEST_F(NavigationControllerTest, loadsAPushedScreenAndHandsAPoppedOneBack) {
  const auto pushed = makeScreen<FakeTable>();
  navigation->pushViewController(pushed);
  EXPECT_TRUE(pushed->isViewLoaded());
  EXPECT_EQ(navigation->topViewController(), pushed);
  EXPECT_EQ(navigation->popViewController(), pushed);
  EXPECT_EQ(navigation->topViewController(), root);
}

TEST_F(NavigationControllerTest, tellsItsObserverOfEveryChange) {
  int changes = 0;
  navigation->setObserver([&changes] { ++changes; });
  navigation->pushViewController(makeScreen<FakeTable>());
  navigation->popViewController();
  navigation->popViewController();
  EXPECT_EQ(changes, 2);
}

TEST_F(NavigationControllerTest, followsARowToTheScreenOfTheStoryboard) {
  snapshotOf(*root);
  EXPECT_TRUE(followRow(*navigation, storyboard, {0, 0}));
  ASSERT_EQ(navigation->viewControllers().size(), 2U);
  EXPECT_EQ(navigation->topViewController()->title(), "LTE");
}

TEST_F(NavigationControllerTest, doesNotFollowARowThatWasNotDrawn) {
  EXPECT_FALSE(followRow(*navigation, storyboard, {0, 0}));
  snapshotOf(*root);
  EXPECT_FALSE(followRow(*navigation, storyboard, {0, 1}));
  EXPECT_EQ(navigation->viewControllers().size(), 1U);
}

TEST_F(NavigationControllerTest, doesNotFollowARowThatLeadsNowhere) {
  snapshotOf(*root);
  for (const char* destination : {"", "NoSuchScreen"}) {
    storyboard.destination = destination;
    EXPECT_FALSE(followRow(*navigation, storyboard, {0, 0}));
  }
}

TEST(ViewController, loadsItsViewOnce) {
  struct Counting final : ViewController {
    void viewDidLoad() override { ++loads; }
    int loads = 0;
  };
  Counting controller;
  controller.loadViewIfNeeded();
  controller.loadViewIfNeeded();
  EXPECT_EQ(controller.loads, 1);
}

}  // namespace
}  // namespace qel
