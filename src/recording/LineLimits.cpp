#include "recording/LineLimits.h"

namespace qel {
namespace {

// Counts as the reader of lines does.
class Count {
 public:
  bool add(const Value& value, std::size_t depth) {
    if (++_values > kMostValuesOfALine) return false;
    if (const List* list = value.asList()) return addAll(*list, depth + 1);
    if (const Dictionary* nested = value.asDictionary()) return add(*nested, depth + 1, 0);
    return true;
  }

  bool add(const Dictionary& dictionary, std::size_t depth, std::size_t otherKeys) {
    if (depth > kDeepestNesting || dictionary.size() + otherKeys > kMostKeysOfAnObject)
      return false;
    _values += otherKeys;
    for (const auto& [key, value] : dictionary) {
      if (!add(value, depth)) return false;
    }
    return true;
  }

 private:
  bool addAll(const List& list, std::size_t depth) {
    if (depth > kDeepestNesting) return false;
    for (const Value& value : list) {
      if (!add(value, depth)) return false;
    }
    return true;
  }

  std::size_t _values = 0;
};

}  // namespace

bool isWithinLineLimits(const Dictionary& entries) {
  return Count().add(entries, 1, kKeysOfTheLine);
}

}  // namespace qel
