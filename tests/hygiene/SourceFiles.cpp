#include "hygiene/SourceFiles.h"

#include <algorithm>
#include <fstream>
#include <sstream>

namespace qel::testing {

namespace fs = std::filesystem;

fs::path repository() { return QEL_SOURCE_DIR; }

std::vector<fs::path> filesBelow(const std::string& folder,
                                 const std::vector<std::string>& endings) {
  std::vector<fs::path> files;
  for (const auto& entry : fs::recursive_directory_iterator(repository() / folder)) {
    const bool wanted =
        std::find(endings.begin(), endings.end(), entry.path().extension()) != endings.end();
    if (entry.is_regular_file() && wanted) files.push_back(entry.path());
  }
  std::sort(files.begin(), files.end());
  return files;
}

std::string contentOf(const fs::path& file) {
  std::ostringstream content;
  content << std::ifstream(file).rdbuf();
  return content.str();
}

std::vector<std::string> linesOf(const fs::path& file) {
  std::vector<std::string> lines;
  std::ifstream stream(file);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

std::string nameOf(const fs::path& file) { return fs::relative(file, repository()).string(); }

}  // namespace qel::testing
