#include "ui/kit/ResourceBundle.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

namespace qel {
namespace {

namespace fs = std::filesystem;

class DirectoryBundleTest : public ::testing::Test {
 protected:
  DirectoryBundleTest() {
    fs::create_directories(folder / "sub.txt");
    std::ofstream(folder / "orb.deviceconfig") << "x";
  }
  ~DirectoryBundleTest() override { fs::remove_all(folder); }

  fs::path folder =
      fs::path(::testing::TempDir()) / ("qelwatch_bundle_test" + std::to_string(::getpid()));
  DirectoryBundle bundle{folder.string()};
};

TEST_F(DirectoryBundleTest, findsAFileByNameAndType) {
  EXPECT_EQ(bundle.pathForResource("orb", "deviceconfig"), (folder / "orb.deviceconfig").string());
}

TEST_F(DirectoryBundleTest, findsNothingUnderAnotherNameOrType) {
  EXPECT_FALSE(bundle.pathForResource("orb", "txt"));
  EXPECT_FALSE(bundle.pathForResource("Orb", "deviceconfig"));
  EXPECT_FALSE(bundle.pathForResource("", ""));
}

TEST_F(DirectoryBundleTest, takesNoFolderForAFile) {
  EXPECT_FALSE(bundle.pathForResource("sub", "txt"));
}

TEST(ResourceBundle, isEmptyUntilItIsSet) {
  EXPECT_FALSE(ResourceBundle::main().pathForResource("orb_test_lte", "deviceconfig"));
}

}  // namespace
}  // namespace qel
