#include "fuzz/support/Variants.h"

#include <bit>
#include <cstdint>
#include <vector>

namespace qel::fuzz {
namespace {

constexpr int kDeepest = 3;
constexpr std::size_t kMostElements = 12;

template <class Made>
auto several(Input& input, const Made& made) {
  std::vector<decltype(made())> elements;
  for (std::size_t left = input.below(kMostElements); left > 0; --left) elements.push_back(made());
  return elements;
}

sdbus::ObjectPath nextPath(Input& input) {
  return sdbus::ObjectPath("/" + std::to_string(input.below(8)));
}

template <class Number, class Raw>
sdbus::Variant numberOf(Input& input) {
  return sdbus::Variant(std::bit_cast<Number>(input.number<Raw>()));
}

}  // namespace

std::string nextWord(Input& input, Words words) {
  const std::size_t which = input.byte();
  return which < words.size() ? std::string(words[which]) : input.plainText();
}

sdbus::Variant nextVariant(Input& input, Words words, int depth) {
  using Kind = VariantKind;
  switch (static_cast<Kind>(input.below(kVariantKinds))) {
    case Kind::boolean:
      return sdbus::Variant((input.byte() & 1) != 0);
    case Kind::u8:
      return sdbus::Variant(input.byte());
    case Kind::i16:
      return numberOf<std::int16_t, std::uint16_t>(input);
    case Kind::u16:
      return sdbus::Variant(input.number<std::uint16_t>());
    case Kind::i32:
      return numberOf<std::int32_t, std::uint32_t>(input);
    case Kind::i64:
      return numberOf<std::int64_t, std::uint64_t>(input);
    case Kind::u64:
      return sdbus::Variant(input.number<std::uint64_t>());
    case Kind::real:
      return numberOf<double, std::uint64_t>(input);
    case Kind::text:
      return sdbus::Variant(nextWord(input, words));
    case Kind::path:
      return sdbus::Variant(nextPath(input));
    case Kind::bytes:
      return sdbus::Variant(several(input, [&] { return input.byte(); }));
    case Kind::texts:
      return sdbus::Variant(several(input, [&] { return nextWord(input, words); }));
    case Kind::paths:
      return sdbus::Variant(several(input, [&] { return nextPath(input); }));
    case Kind::dictionary:
      if (depth < kDeepest) return sdbus::Variant(nextVariants(input, words, depth + 1));
      break;
    case Kind::numbered:
      if (depth < kDeepest) {
        std::map<std::uint32_t, sdbus::Variant> map;
        for (std::size_t left = input.below(kMostElements); left > 0; --left) {
          const std::uint32_t key = input.byte();
          map.insert_or_assign(key, nextVariant(input, words, depth + 1));
        }
        return sdbus::Variant(map);
      }
      break;
    case Kind::u32:
      break;
  }
  return sdbus::Variant(input.number<std::uint32_t>());
}

Variants nextVariants(Input& input, Words words, int depth) {
  Variants variants;
  for (std::size_t left = input.below(kMostElements); left > 0; --left) {
    std::string key = nextWord(input, words);
    variants.insert_or_assign(std::move(key), nextVariant(input, words, depth));
  }
  return variants;
}

}  // namespace qel::fuzz
