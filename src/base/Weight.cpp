#include "base/Weight.h"

namespace qel {

std::size_t weightOf(const Value& value) {
  std::size_t weight = sizeof value;
  if (const auto text = value.asText()) weight += text->size();
  if (const Bytes* bytes = value.asBytes()) weight += bytes->size();
  if (const Dictionary* nested = value.asDictionary()) weight += weightOf(*nested);
  if (const List* list = value.asList()) {
    for (const Value& element : *list) weight += weightOf(element);
  }
  return weight;
}

std::size_t weightOf(const Dictionary& dictionary) {
  std::size_t weight = 0;
  for (const auto& [key, value] : dictionary) {
    weight += sizeof key + key.view().size() + weightOf(value);
  }
  return weight;
}

}  // namespace qel
