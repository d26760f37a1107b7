// docs/fields.md is made from the schemas; this notices when it was not made again.
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <string>

namespace {

std::string contentOf(const char* path) {
  std::ifstream stream(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(stream), {}};
}

TEST(FieldsDocument, isTheOneThatTheSchemasGive) {
  const std::string made = contentOf(QEL_FIELDS_MADE);
  ASSERT_FALSE(made.empty()) << "nothing was made at " QEL_FIELDS_MADE;
  // One comparison of the whole, without a page of differences.
  EXPECT_TRUE(contentOf(QEL_FIELDS_COMMITTED) == made)
      << "docs/fields.md is stale; build the target update-fields-document and commit it";
}

}  // namespace
