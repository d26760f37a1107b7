#include "export/ShownUnits.h"

#include <algorithm>

namespace qel {

const Rewrite* rewriteOf(std::span<const Rewrite> rewrites, std::string_view key) {
  const auto found =
      std::ranges::find(rewrites, key, [](const Rewrite& each) { return each.key.view(); });
  return found == rewrites.end() ? nullptr : &*found;
}

bool makesText(const Rewrite& rewrite) {
  return rewrite.kind == Rewrite::Kind::listText || rewrite.kind == Rewrite::Kind::integerListText;
}

bool isTime(const FieldFacts* facts) { return facts && facts->form == FieldForm::time; }

std::string unitOf(const FieldFacts* facts, const Rewrite* rewrite) {
  if (!facts || isTime(facts)) return "";
  return std::string(rewrite || facts->raw.empty() ? facts->unit : facts->raw);
}

}  // namespace qel
