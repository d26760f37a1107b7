// What qelctl export wrote, read back by other means.
#pragma once

#include <cstdlib>
#include <filesystem>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace qel::testing {

// A folder that is gone with the test.
class Folder {
 public:
  Folder() {
    std::string pattern =
        (std::filesystem::temp_directory_path() / "qelctl-export-XXXXXX").string();
    _path = ::mkdtemp(pattern.data());
  }
  ~Folder() { std::filesystem::remove_all(_path); }
  std::string operator/(const std::string& name) const { return _path + "/" + name; }
  std::set<std::string> names() const {
    std::set<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(_path)) {
      names.insert(entry.path().filename().string());
    }
    return names;
  }

 private:
  std::string _path;
};

// Column to cell; what was not reported is not there.
using ExportedRow = std::map<std::string, std::string>;

struct ExportedTable {
  std::vector<std::string> header;
  std::map<std::string, std::string> units;  // of columns that have one
  std::set<std::string> texts;  // columns of texts, where types are known: in a database
  std::vector<ExportedRow> rows;
};

using ExportedTables = std::map<std::string, ExportedTable>;

// Every file NAME.csv of the folder, as RFC 4180 has it; anything else is a failure of the test.
ExportedTables readCsv(const std::string& folder);

// Every table of the database but "units". A number is as its shortest text, bytes "<0a1b2c>"; a
// value of another type than its column's is a failure of the test.
ExportedTables readSqlite(const std::string& path);

}  // namespace qel::testing
