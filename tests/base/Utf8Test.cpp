#include "base/Utf8.h"

#include <gtest/gtest.h>

namespace qel {
namespace {

constexpr std::string_view kReplacement = "\xEF\xBF\xBD";

std::string replaced(std::initializer_list<std::string_view> parts) {
  std::string text;
  for (const auto part : parts) text += part == "?" ? kReplacement : part;
  return text;
}

TEST(Utf8, acceptsEveryLengthOfSequence) {
  for (const std::string_view text :
       {"", "a", "\xC2\x80", "\xDF\xBF", "\xE0\xA0\x80", "\xED\x9F\xBF", "\xEE\x80\x80",
        "\xF0\x90\x80\x80", "\xF4\x8F\xBF\xBF"}) {
    EXPECT_TRUE(isValidUtf8(text));
    EXPECT_EQ(withReplacements(text), text);
  }
}

TEST(Utf8, refusesOverlongSurrogateAndTooLargeSequences) {
  for (const std::string_view text : {"\xC0\x80", "\xC1\xBF", "\xE0\x9F\xBF", "\xED\xA0\x80",
                                      "\xF0\x8F\xBF\xBF", "\xF4\x90\x80\x80", "\xF5\x80\x80\x80",
                                      "\x80", "\xFF", "\xC2", "\xE2\x82", "\xF0\x9F\x98"}) {
    EXPECT_FALSE(isValidUtf8(text));
  }
}

// The example of the Unicode standard for maximal subparts.
TEST(Utf8, replacesTheLongestStartOfASequenceOnce) {
  EXPECT_EQ(withReplacements("a\xF1\x80\x80\xE1\x80\xC2"
                             "b\x80"
                             "c\x80\xBF"
                             "d"),
            replaced({"a", "?", "?", "?", "b", "?", "c", "?", "?", "d"}));
}

}  // namespace
}  // namespace qel
