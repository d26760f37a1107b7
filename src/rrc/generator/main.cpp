// rrc-tables NAME DIRECTORY SCHEMA…: writes NAME_schema.h and NAME_schema.cpp into the directory.

#include <cstdio>
#include <fstream>
#include <iterator>
#include <string>

#include "rrc/generator/Code.h"

namespace qel::rrc::generator {
namespace {

std::string contentOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  if (file.bad() || text.empty()) throw NotationError(path + ": cannot be read");
  return text;
}

void write(const std::string& path, const std::string& text) {
  std::ofstream file(path, std::ios::binary);
  file << text;
  if (!file.flush()) throw NotationError(path + ": cannot be written");
}

void make(const std::string& name, const std::string& directory, int count, char** schemas) {
  std::vector<Definition> definitions;
  for (int i = 0; i < count; ++i) readNotation(contentOf(schemas[i]), schemas[i], definitions);
  const Tables tables = tablesFrom(definitions);
  write(directory + "/" + name + "_schema.h", headerCode(tables, name));
  write(directory + "/" + name + "_schema.cpp", sourceCode(tables, name));
}

}  // namespace
}  // namespace qel::rrc::generator

int main(int count, char** arguments) {
  if (count < 4) {
    std::fputs("rrc-tables NAME DIRECTORY SCHEMA...\n", stderr);
    return 64;
  }
  try {
    qel::rrc::generator::make(arguments[1], arguments[2], count - 3, arguments + 3);
  } catch (const qel::rrc::generator::NotationError& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 65;
  }
  return 0;
}
