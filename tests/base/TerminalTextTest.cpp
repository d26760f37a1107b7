// Text from outside as a terminal may have it. Characters beyond the first 128 reached it as they
// came, some of them commands.

#include "base/TerminalText.h"

#include <gtest/gtest.h>
#include <pty.h>
#include <unistd.h>

#include <array>

#include "base/DescriptorSink.h"

namespace qel {
namespace {

std::string utf8(char32_t character) {
  const auto byte = [](char32_t bits) { return static_cast<char>(bits); };
  if (character < 0x80) return {byte(character)};
  if (character < 0x800) return {byte(0xC0 | character >> 6), byte(0x80 | (character & 0x3F))};
  return {byte(0xE0 | character >> 12), byte(0x80 | (character >> 6 & 0x3F)),
          byte(0x80 | (character & 0x3F))};
}

struct Range {
  char32_t first;
  char32_t last;
};

TEST(TerminalText, isWithoutCharactersThatATerminalObeys) {
  for (const auto& [first, last] :
       {Range{0x00, 0x1F}, Range{0x7F, 0x9F}, Range{0x061C, 0x061C}, Range{0x200E, 0x200F},
        Range{0x2028, 0x202E}, Range{0x2066, 0x2069}}) {
    for (char32_t character = first; character <= last; ++character) {
      char escaped[7];
      std::snprintf(escaped, sizeof escaped, "\\u%04x", static_cast<unsigned>(character));
      const std::string text = "a" + utf8(character) + "z";
      EXPECT_EQ(forTerminal(text), "a" + std::string(escaped) + "z");
      EXPECT_EQ(forTerminal(text, Instead::blank), "a z");
    }
    EXPECT_EQ(forTerminal(utf8(last + 1)), utf8(last + 1)) << static_cast<unsigned>(last);
    if (first > 0) {
      EXPECT_EQ(forTerminal(utf8(first - 1)), utf8(first - 1)) << static_cast<unsigned>(first);
    }
  }
}

TEST(TerminalText, leavesAllOtherTextAsItIs) {
  for (const char* text : {"", "plain", "back\\slash \"quoted\"", "Zürich", "日本",
                           "\xF0\x9F\x93\xB1", "\xEF\xBF\xBD"}) {
    EXPECT_EQ(forTerminal(text), text);
  }
}

TEST(TerminalText, isValidUtf8) {
  EXPECT_EQ(forTerminal("a\xFFz\xC2"), "a\xEF\xBF\xBDz\xEF\xBF\xBD");
  // A C1 control alone, as a terminal in an eight-bit mode takes it.
  EXPECT_EQ(forTerminal("\x9B"), "\xEF\xBF\xBD");
}

// What lines come out as, of a terminal or of a pipe.
std::string linesThrough(bool isTerminal, std::string_view line) {
  std::array<int, 2> ends{};
  if (isTerminal) {
    EXPECT_EQ(::openpty(&ends[0], &ends[1], nullptr, nullptr, nullptr), 0);
  } else {
    EXPECT_EQ(::pipe(ends.data()), 0);
  }
  BatchingSink sink(ends[1]);
  sink.write(line);
  sink.flush();
  std::array<char, 256> text{};
  const ssize_t count = ::read(ends[0], text.data(), text.size());
  for (const int end : ends) ::close(end);
  return {text.data(), count < 0 ? 0 : static_cast<std::size_t>(count)};
}

TEST(TerminalText, isWhatATerminalGetsOfALineAndNobodyElse) {
  const std::string line = "{\"apn\": \"a\xC2\x9Bz\"}";
  EXPECT_EQ(linesThrough(true, line), "{\"apn\": \"a\\u009bz\"}\r\n");
  EXPECT_EQ(linesThrough(false, line), line + "\n");
}

TEST(TerminalTextDeathTest, isInTheLineOfAComplaintAndOfAFatalError) {
  const auto end = [] {
    complain("tester", "a file\n\x1B[2J\xC2\x9B is gone");
    std::_Exit(3);
  };
  EXPECT_EXIT(end(), ::testing::ExitedWithCode(3),
              "^tester: a file.u000a.u001b.2J.u009b is gone\n$");
}

}  // namespace
}  // namespace qel
