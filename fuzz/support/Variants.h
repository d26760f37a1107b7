// Values as they come over the bus, of whatever type the input says.
#pragma once

#include <sdbus-c++/Types.h>

#include <cstdint>
#include <map>
#include <span>
#include <string>
#include <string_view>

#include "fuzz/support/Input.h"

namespace qel::fuzz {

enum class VariantKind : std::uint8_t {
  boolean,
  u8,
  i16,
  u16,
  i32,
  u32,
  i64,
  u64,
  real,
  text,
  path,
  bytes,
  texts,
  paths,
  dictionary,
  numbered,
};
constexpr std::size_t kVariantKinds = static_cast<std::size_t>(VariantKind::numbered) + 1;

using Variants = std::map<std::string, sdbus::Variant>;
using Words = std::span<const std::string_view>;

// Texts and keys are of `words`, or any that the bus lets pass.
sdbus::Variant nextVariant(Input& input, Words words, int depth = 0);
Variants nextVariants(Input& input, Words words, int depth = 0);
std::string nextWord(Input& input, Words words);

}  // namespace qel::fuzz
