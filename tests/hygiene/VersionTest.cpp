// One version everywhere: what the changelog tells of is what packages and software centres are
// told.

#include <gtest/gtest.h>

#include <ctime>
#include <iomanip>
#include <regex>
#include <sstream>

#include "hygiene/SourceFiles.h"

namespace qel::testing {
namespace {

struct Release {
  std::string version;
  std::string date;
  bool operator==(const Release&) const = default;
};

void PrintTo(const Release& release, std::ostream* out) {
  *out << release.version << " of " << release.date;
}

// "22 November 2026" or "22 Nov 2026" as "2026-11-22"; others as they are.
std::string isoDate(const std::string& text) {
  std::tm date{};
  std::istringstream stream(text);
  if (!(stream >> std::get_time(&date, "%d %B %Y"))) return text;
  std::ostringstream iso;
  iso << std::put_time(&date, "%Y-%m-%d");
  return iso.str();
}

// What the pattern's two groups find in the file, version and date, in the order of the file.
std::vector<Release> releasesIn(const std::string& file, const std::string& pattern) {
  const std::string content = contentOf(repository() / file);
  const std::regex regex(pattern, std::regex::ECMAScript | std::regex::multiline);
  std::vector<Release> releases;
  for (std::sregex_iterator it(content.begin(), content.end(), regex), end; it != end; ++it) {
    releases.push_back({(*it)[1], isoDate((*it)[2])});
  }
  return releases;
}

std::vector<Release> releasesOfChangelog() {
  return releasesIn("CHANGELOG.md", R"(^## ([0-9.]+), ([0-9]+ [A-Z][a-z]+ [0-9]{4})$)");
}

// What the pattern's group finds first.
std::string found(const std::string& file, const std::string& pattern) {
  const std::string content = contentOf(repository() / file);
  std::smatch match;
  return std::regex_search(content, match, std::regex(pattern)) ? match[1].str() : "nothing";
}

TEST(Versions, ofTheChangelogAreThoseOfSoftwareCentres) {
  const auto releases = releasesOfChangelog();
  ASSERT_GE(releases.size(), 2u);
  EXPECT_EQ(releasesIn("packaging/desktop/tesk.qelwatch.viewer.metainfo.xml",
                       R"re(<release [^>]*version="([0-9.]+)" date="([0-9-]+)")re"),
            releases);
}

TEST(Versions, ofTheChangelogAreThoseOfDebian) {
  EXPECT_EQ(releasesIn("packaging/deb/changelog.Debian",
                       R"(^@QEL_PACKAGE@ \(([0-9.]+)-1\)[^@]*\n -- [^@]*@[^@]*>  [A-Z][a-z]+, )"
                       R"(([0-9]+ [A-Z][a-z]+ [0-9]{4}) )"),
            releasesOfChangelog());
}

TEST(Versions, areThatOfTheNewestReleaseWhereverOneIsNamed) {
  const auto releases = releasesOfChangelog();
  ASSERT_FALSE(releases.empty());
  const Release& newest = releases.front();
  EXPECT_EQ(found("CMakeLists.txt", R"(project\(qelwatch VERSION ([0-9.]+) )"), newest.version);
  EXPECT_EQ(found("packaging/CMakeLists.txt", R"(QEL_RELEASE_DATE ([0-9-]+))"), newest.date);
  EXPECT_EQ(found("packaging/alpine/APKBUILD", R"(pkgver=([0-9.]+))"), newest.version);
  EXPECT_EQ(found("docs/phones.md", R"(--prefix=qelwatch-([0-9.]+)/)"), newest.version);
  EXPECT_EQ(found("docs/phones.md", R"(qelwatch-([0-9.]+)\.tar\.gz)"), newest.version);
}

}  // namespace
}  // namespace qel::testing
