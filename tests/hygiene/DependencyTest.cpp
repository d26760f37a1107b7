// The dependency rule: a folder includes only from folders below it, and a foreign library shows
// only where it is meant to.

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <optional>
#include <set>

#include "hygiene/SourceFiles.h"

namespace qel::testing {
namespace {

// Folder → the folders that it may include from, besides itself.
const std::map<std::string, std::set<std::string>> kAllowed = {
    {"base", {}},
    {"messages", {"base"}},
    {"radio", {"base", "messages"}},
    {"rrc", {"base"}},
    {"recording", {"base", "messages"}},
    {"bus", {"base"}},
    {"sources", {"base", "bus", "messages", "radio", "recording", "rrc"}},
    {"tesk", {"base", "bus", "messages"}},
    {"service", {"base", "bus", "messages", "sources", "tesk"}},
    {"capture", {"base", "messages", "recording", "tesk"}},
    {"connection", {"base", "tesk"}},
    {"metrics", {"base", "connection", "messages"}},
    {"history", {"base", "messages", "metrics", "radio", "recording"}},
    {"export", {"base", "history", "messages", "metrics", "recording"}},
    {"ui",
     {"base", "capture", "connection", "history", "messages", "metrics", "radio", "recording"}},
    {"feed", {"base", "history", "service", "sources", "tesk", "ui"}},
    {"fleet",
     {"base", "capture", "export", "history", "messages", "metrics", "radio", "recording", "tesk"}},
    {"app",
     {"base", "bus", "capture", "feed", "history", "metrics", "recording", "service", "sources",
      "tesk", "ui"}},
    {"tools",
     {"base", "bus", "capture", "export", "feed", "fleet", "history", "messages", "metrics",
      "radio", "recording", "sources", "tesk", "ui"}},
};

// Foreign header prefix → the folders (path prefixes in src/) that may include it.
const std::vector<std::pair<std::string, std::vector<std::string>>> kForeign = {
    {"Q", {"src/ui/quick/", "src/app/"}},
    {"sdbus-c++/", {"src/bus/", "src/sources/modem_manager/", "src/tesk/", "src/service/"}},
    {"google/protobuf/", {"src/messages/generator/"}},
    {"nlohmann/", {"src/recording/", "src/tools/"}},
    {"CLI/", {"src/tools/", "src/app/", "src/service/daemon/"}},
    {"sqlite3.h", {"src/export/", "src/fleet/"}},
    {"mosquitto.h", {"src/fleet/"}},
    {"prometheus/", {"src/fleet/"}},
    {"civetweb.h", {"src/fleet/"}},
    {"pqxx/", {"src/fleet/collect/"}},
    {"libpq-fe.h", {"src/fleet/collect/"}},
    {"curses.h", {"src/tools/watch/"}},
    {"zlib.h", {"src/recording/"}},
};

// What stands between the given marks of an #include line, if it is one.
std::optional<std::string> included(const std::string& line, char open, char close) {
  if (!line.starts_with("#include")) return std::nullopt;
  const auto start = line.find(open);
  const auto end = line.find(close, start + 1);
  if (start == std::string::npos || end == std::string::npos) return std::nullopt;
  return line.substr(start + 1, end - start - 1);
}

std::string firstFolder(const std::string& path) { return path.substr(0, path.find('/')); }

std::vector<std::filesystem::path> sources() { return filesBelow("src", {".h", ".cpp", ".inl"}); }

TEST(DependencyRule, holdsForEveryInclude) {
  ASSERT_GT(sources().size(), 50U);
  for (const auto& file : sources()) {
    const std::string folder = firstFolder(nameOf(file).substr(4));
    ASSERT_TRUE(kAllowed.contains(folder)) << nameOf(file) << " is in no known folder";
    for (const std::string& line : linesOf(file)) {
      const auto path = included(line, '"', '"');
      if (!path) continue;
      const std::string from = firstFolder(*path);
      EXPECT_TRUE(from == folder || kAllowed.at(folder).contains(from))
          << nameOf(file) << " includes " << *path;
    }
  }
}

TEST(DependencyRule, keepsForeignLibrariesWhereTheyBelong) {
  for (const auto& file : sources()) {
    const std::string name = nameOf(file);
    for (const std::string& line : linesOf(file)) {
      const auto path = included(line, '<', '>');
      if (!path) continue;
      for (const auto& [prefix, folders] : kForeign) {
        if (!path->starts_with(prefix)) continue;
        const bool allowed = std::any_of(folders.begin(), folders.end(), [&](const auto& folder) {
          return name.starts_with(folder);
        });
        EXPECT_TRUE(allowed) << name << " includes <" << *path << ">";
      }
    }
  }
}

TEST(SourceFiles, liveUnderOneNamespaceAndGuard) {
  for (const auto& file : filesBelow("src", {".h"})) {
    EXPECT_NE(contentOf(file).find("#pragma once"), std::string::npos) << nameOf(file);
  }
}

}  // namespace
}  // namespace qel::testing
