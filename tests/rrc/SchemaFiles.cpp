#include "rrc/SchemaFiles.h"

#include <fstream>
#include <iterator>
#include <sstream>

namespace qel::testing {

using namespace rrc::generator;

namespace {

Tables tablesOfFiles(const char* colonSeparated) {
  std::vector<Definition> definitions;
  std::istringstream paths(colonSeparated);
  for (std::string path; std::getline(paths, path, ':');) {
    std::ifstream file(path, std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    readNotation(text, path, definitions);
  }
  return tablesFrom(definitions, Wanted::every);
}

}  // namespace

const Tables& lteTables() {
  static const Tables tables = tablesOfFiles(QEL_RRC_LTE_SCHEMAS);
  return tables;
}

const Tables& umtsTables() {
  static const Tables tables = tablesOfFiles(QEL_RRC_UMTS_SCHEMAS);
  return tables;
}

Tables tablesOf(std::string_view notation, Wanted wanted) {
  std::vector<Definition> definitions;
  readNotation(notation, "test", definitions);
  return tablesFrom(definitions, wanted);
}

}  // namespace qel::testing
