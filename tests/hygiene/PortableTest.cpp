// What keeps the sources fit for other systems than this one.

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <string_view>
#include <unordered_set>

#include "hygiene/SourceFiles.h"

namespace qel::testing {
namespace {

using Words = std::unordered_set<std::string_view>;

// Calls and headers that the GNU C library alone has; phones with musl must do without.
const Words kGnuOnly = {"__GLIBC__",
                        "backtrace",
                        "backtrace_symbols",
                        "backtrace_symbols_fd",
                        "canonicalize_file_name",
                        "dlinfo",
                        "dlmopen",
                        "fopencookie",
                        "gnu_get_libc_version",
                        "mallinfo",
                        "mallinfo2",
                        "malloc_info",
                        "malloc_trim",
                        "mallopt",
                        "pthread_clockjoin_np",
                        "pthread_sigqueue",
                        "pthread_timedjoin_np",
                        "pthread_tryjoin_np",
                        "pthread_yield",
                        "rawmemchr",
                        "sigabbrev_np",
                        "strerrordesc_np",
                        "strerrorname_np",
                        "TEMP_FAILURE_RETRY",
                        "<argp.h>",
                        "<error.h>",
                        "<execinfo.h>",
                        "<fts.h>",
                        "<gnu/libc-version.h>",
                        "<obstack.h>",
                        "<printf.h>",
                        "<sys/cdefs.h>",
                        "<sys/queue.h>"};

// Packages of the same sources are the same, whenever they were built.
const Words kTimeOfCompiling = {"__DATE__", "__TIME__", "__TIMESTAMP__"};

bool isPartOfWord(char c) {
  return std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '_' || c == '<' || c == '>' ||
         c == '/' || c == '.' || c == '-';
}
bool isPartOfName(char c) { return std::isalnum(static_cast<unsigned char>(c)) != 0 || c == '_'; }

bool hasOneOf(const Words& words, std::string_view line) {
  const auto isPart = line.starts_with("#include") ? isPartOfWord : isPartOfName;
  for (auto at = line.begin(); at != line.end();) {
    at = std::find_if(at, line.end(), isPart);
    const auto end = std::find_if_not(at, line.end(), isPart);
    if (words.contains({at, end})) return true;
    at = end;
  }
  return false;
}

std::vector<std::string> linesWith(const Words& words) {
  std::vector<std::string> found;
  for (const auto& file : filesBelow("src", {".h", ".cpp", ".inl"})) {
    for (const std::string& line : linesOf(file)) {
      if (hasOneOf(words, line)) found.push_back(nameOf(file) + ": " + line);
    }
  }
  return found;
}

TEST(Sources, callNothingThatTheGnuLibraryAloneHas) {
  EXPECT_EQ(linesWith(kGnuOnly), std::vector<std::string>());
  for (const char* line :
       {"  malloc_trim(0);", "#include <execinfo.h>", "if (::backtrace (a, 9))"}) {
    EXPECT_TRUE(hasOneOf(kGnuOnly, line)) << line;
  }
}

TEST(Sources, doNotAskWhenTheyAreCompiled) {
  EXPECT_EQ(linesWith(kTimeOfCompiling), std::vector<std::string>());
  EXPECT_TRUE(hasOneOf(kTimeOfCompiling, "const char* built = __DATE__;"));
}

}  // namespace
}  // namespace qel::testing
