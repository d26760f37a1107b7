#include "rrc/generator/Notation.h"

#include <gtest/gtest.h>

#include "rrc/SchemaFiles.h"
#include "rrc/generator/Code.h"

namespace qel::rrc::generator {
namespace {

using testing::tablesOf;

std::string complaintAbout(std::string_view notation) {
  try {
    tablesOf(notation);
  } catch (const NotationError& error) {
    return error.what();
  }
  return "nothing";
}

TEST(Notation, saysWhatIsWrongAndWhere) {
  const std::pair<const char*, const char*> mistakes[] = {
      {"message A = INT 3..1", "test:1: a range that ends before it begins: 3..1"},
      {"message A = INT x..1", "test:1: not a range: x..1"},
      {"message A = INT", "test:1: the line ends too early"},
      {"message A = INT 0..1 more", "test:1: too much: more"},
      {"message A INT 0..1", "test:1: '=' is missing"},
      {"message A = WORD!", "test:1: not a type: WORD!"},
      {"message A = B", "test:1: another name for a type: A"},
      {"message 1A = NULL", "test:1: not a name: 1A"},
      {"message A = NULL\nB = NULL", "test:2: nothing uses B"},
      {"message A = NULL\nmessage A = NULL", "test:2: a second A"},
      {"message A = SEQUENCE\n  x B", "test:2: no type has the name B"},
      {"message A = SEQUENCE\n  x NULL\n  x NULL", "test:3: a second x"},
      {"message A = SEQUENCE\n   x NULL", "test:2: indented by no step of two"},
      {"  x NULL", "test:1: indented, but nothing is open"},
      {"message A = CHOICE", "test:1: a choice of nothing"},
      {"message A = CHOICE\n  x? NULL", "test:2: only a sequence's own fields can be optional"},
      {"message A = SEQUENCE\n  ...\n  x? NULL",
       "test:3: only a sequence's own fields can be optional"},
      {"message A = SEQUENCE\n  ...\n  skip 0", "test:3: no such count"},
      {"message A = SEQUENCE\n  ...\n  skip 65", "test:3: no such count"},
      {"message A = ENUM 0", "test:1: no such count: 0"},
      {"message A = ENUM 2: 1 2 3", "test:1: more numbers than values"},
      {"message A = ENUM 2:", "test:1: numbers are missing"},
      {"message A = ENUM 2: one", "test:1: not a number: one"},
      {"message A = LIST 1..2 NULL", "test:1: 'OF' is missing"},
      {"message A = LIST 0..65536 OF NULL", "test:1: no such size"},
      {"message A = BITS -1..4", "test:1: no such size"},
      {"message A = SEQUENCE\n  x B\nB = LIST 1..2 OF A", "test:1: a type lies in itself"},
      {"message A = SEQUENCE\n  !q-x NULL\n  !qX NULL",
       "test:3: qX and q-x are the same name in C++"},
  };
  for (const auto& [notation, complaint] : mistakes) {
    EXPECT_EQ(complaintAbout(notation), complaint) << notation;
  }
}

TEST(Notation, countsLinesThatSayNothing) {
  EXPECT_EQ(complaintAbout("# a comment\n\nmessage A = SEQUENCE  # another\n  x y\n"),
            "test:4: no type has the name y");
}

TEST(Notation, refusesTypesThatLieTooDeep) {
  const auto nested = [](unsigned depth) {
    std::string text = "message A = SEQUENCE\n";
    for (unsigned i = 2; i < depth; ++i) text += std::string(2 * i - 2, ' ') + "x SEQUENCE\n";
    return text + std::string(2 * depth - 2, ' ') + "x NULL\n";
  };
  EXPECT_EQ(complaintAbout(nested(kDeepest)), "nothing");
  EXPECT_EQ(complaintAbout(nested(kDeepest + 1)), "test:1: types lie too deep in one another");
}

TEST(Notation, givesMarksOnlyToWhatIsWanted) {
  const Tables tables = tablesOf(
      "message A = SEQUENCE\n"
      "  !q-QualMin-r9 INT 0..1\n"
      "  other BOOL\n"
      "  inner SEQUENCE\n"
      "    !q-QualMin-r9? BOOL\n");
  ASSERT_EQ(tables.markNames, (std::vector<std::string>{"q-QualMin-r9"}));
  const Type& top = tables.types[static_cast<std::size_t>(tables.message("A"))];
  EXPECT_EQ(tables.fields[top.first].mark, Mark::first);
  EXPECT_EQ(tables.fields[top.first + 1U].mark, Mark::none);
}

TEST(Notation, becomesCppWithNamesForMarksAndMessages) {
  const Tables tables = tablesOf("message UL-CCCH-Message = SEQUENCE\n  !q-Hyst ENUM 2: 1 -\n");
  const std::string header = headerCode(tables, "sample");
  EXPECT_NE(header.find("namespace qel::rrc::sample {"), std::string::npos);
  EXPECT_NE(header.find("inline constexpr TypeIndex ULCCCHMessage{0};"), std::string::npos);
  EXPECT_NE(header.find("inline constexpr Mark qHyst{2};"), std::string::npos);
  const std::string source = sourceCode(tables, "sample");
  EXPECT_NE(source.find("{Kind::enumerated, false, false, 0, 1, TypeIndex::none, 0, 2, 0}"),
            std::string::npos)
      << source;
  EXPECT_NE(source.find("kNoNumber,"), std::string::npos);
}

}  // namespace
}  // namespace qel::rrc::generator
