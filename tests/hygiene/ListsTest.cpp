// What is in the folders is also in the build: nothing is silently left out.

#include <gtest/gtest.h>

#include "hygiene/SourceFiles.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

// The CMakeLists.txt that answers for a file: of its folder or of the next one above that has one.
fs::path listFor(const fs::path& file) {
  fs::path folder = file.parent_path();
  while (!fs::exists(folder / "CMakeLists.txt")) folder = folder.parent_path();
  return folder / "CMakeLists.txt";
}

bool isNamedInItsList(const fs::path& file) {
  const fs::path list = listFor(file);
  const std::string content = contentOf(list);
  return content.find(fs::relative(file, list.parent_path()).string()) != std::string::npos;
}

TEST(BuildLists, nameEverySourceFile) {
  for (const char* folder : {"src", "tests", "trials", "fuzz"}) {
    const auto files = filesBelow(folder, {".cpp", ".qml"});
    ASSERT_FALSE(files.empty());
    for (const auto& file : files) {
      if (nameOf(file).starts_with("tests/support/")) continue;  // built where it is used
      EXPECT_TRUE(isNamedInItsList(file)) << nameOf(file) << " is in no build list";
    }
  }
}

TEST(BuildLists, nameEverySchema) {
  for (const auto& file : filesBelow("src/messages/schemas", {".proto"})) {
    if (file.stem() == "options") continue;  // imported by the others
    const std::string content = contentOf(repository() / "src/messages/CMakeLists.txt");
    EXPECT_NE(content.find(file.stem().string()), std::string::npos) << nameOf(file);
  }
}

TEST(BuildLists, nameEveryTestFolder) {
  const std::string content = contentOf(repository() / "tests/CMakeLists.txt");
  for (const auto& entry : fs::directory_iterator(repository() / "tests")) {
    if (!entry.is_directory() || !fs::exists(entry.path() / "CMakeLists.txt")) continue;
    const std::string line = "add_subdirectory(" + entry.path().filename().string() + ")";
    EXPECT_NE(content.find("\n" + line), std::string::npos) << line;
  }
}

TEST(Tests, areNeverSwitchedOff) {
  const std::string disabled = std::string("DIS") + "ABLED_";
  for (const auto& file : filesBelow("tests", {".cpp", ".h"})) {
    for (const std::string& line : linesOf(file)) {
      const auto start = line.find_first_not_of(' ');
      const std::string text = start == std::string::npos ? "" : line.substr(start);
      EXPECT_EQ(line.find(disabled), std::string::npos) << nameOf(file);
      EXPECT_FALSE(text.starts_with("// TEST") || text.starts_with("//TEST")) << nameOf(file);
    }
  }
}

TEST(SourceFiles, stayShort) {
  constexpr std::size_t kLongest = 400;
  for (const char* folder : {"src", "tests", "trials", "fuzz"}) {
    for (const auto& file : filesBelow(folder, {".h", ".cpp", ".inl", ".qml"})) {
      EXPECT_LE(linesOf(file).size(), kLongest) << nameOf(file);
    }
  }
}

}  // namespace
}  // namespace qel::testing
