// What keeps the sources fit for other systems than this one.

#include <gtest/gtest.h>

#include <regex>

#include "hygiene/SourceFiles.h"

namespace qel::testing {
namespace {

// Lines of the sources that the pattern finds something in, each with its file's name.
std::vector<std::string> linesWith(const std::regex& pattern) {
  std::vector<std::string> found;
  for (const auto& file : filesBelow("src", {".h", ".cpp", ".inl"})) {
    for (const std::string& line : linesOf(file)) {
      if (std::regex_search(line, pattern)) found.push_back(nameOf(file) + ": " + line);
    }
  }
  return found;
}

// Calls and headers that the GNU C library alone has; phones with musl must do without.
const std::regex kGnuOnly(
    R"(\b(__GLIBC__|backtrace(_symbols(_fd)?)?|canonicalize_file_name|dlinfo|dlmopen|fopencookie|)"
    R"(gnu_get_libc_version|mallinfo2?|malloc_info|malloc_trim|mallopt|)"
    R"(pthread_(tryjoin|timedjoin|clockjoin|yield|sigqueue)_np|rawmemchr|register_printf_\w+|strfmon|)"
    R"(strerrordesc_np|strerrorname_np|sigabbrev_np|TEMP_FAILURE_RETRY)\s*\(|)"
    R"(<(error|execinfo|gnu/libc-version|fts|obstack|printf|argp|sys/cdefs|sys/queue)\.h>)");

TEST(Sources, callNothingThatTheGnuLibraryAloneHas) {
  EXPECT_EQ(linesWith(kGnuOnly), std::vector<std::string>());
  for (const char* line : {"malloc_trim(0);", "#include <execinfo.h>", "  if (backtrace (a, 9))"}) {
    EXPECT_TRUE(std::regex_search(line, kGnuOnly)) << line;
  }
}

// Packages of the same sources are the same, whenever and wherever they were built.
TEST(Sources, doNotAskWhenTheyAreCompiled) {
  EXPECT_EQ(linesWith(std::regex(R"(__(DATE|TIME|TIMESTAMP)__)")), std::vector<std::string>());
}

}  // namespace
}  // namespace qel::testing
