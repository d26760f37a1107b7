#include "rrc/generator/Tables.h"

#include <algorithm>
#include <map>
#include <set>

namespace qel::rrc::generator {
namespace {

constexpr std::size_t kMostEntries = 0xFFF0;

bool same(const Type& a, const Type& b) {
  return a.kind == b.kind && a.extensible == b.extensible && a.unbounded == b.unbounded &&
         a.low == b.low && a.high == b.high && a.content == b.content && a.first == b.first &&
         a.count == b.count && a.additions == b.additions;
}

class Maker {
 public:
  Maker(const std::vector<Definition>& definitions, Wanted wanted)
      : _definitions(definitions), _wanted(wanted) {}

  Tables make() {
    for (const Definition& definition : _definitions) declare(definition);
    for (const Definition& definition : _definitions) {
      const TypeIndex index = _named.at(definition.name);
      _tables.types[at(index)] = type(definition.place, definition.shape);
      if (definition.message) _tables.messages.emplace_back(definition.name, index);
    }
    for (const Definition& definition : _definitions) {
      if (!definition.message && !_used.contains(definition.name)) {
        definition.place.refuse("nothing uses " + definition.name);
      }
      depth(definition.place, _named.at(definition.name));
    }
    return std::move(_tables);
  }

 private:
  static std::size_t at(TypeIndex index) { return static_cast<std::size_t>(index); }

  void declare(const Definition& definition) {
    if (!definition.shape.reference.empty()) {
      definition.place.refuse("another name for a type: " + definition.name);
    }
    const auto index = static_cast<TypeIndex>(_tables.types.size());
    if (!_named.emplace(definition.name, index).second) {
      definition.place.refuse("a second " + definition.name);
    }
    _tables.types.emplace_back();
  }

  TypeIndex index(const Place& place, const Shape& shape) {
    if (!shape.reference.empty()) {
      const auto named = _named.find(shape.reference);
      if (named == _named.end()) place.refuse("no type has the name " + shape.reference);
      _used.insert(shape.reference);
      return named->second;
    }
    const Type made = type(place, shape);
    const auto begin = _tables.types.begin() + static_cast<std::ptrdiff_t>(_named.size());
    const auto known =
        std::find_if(begin, _tables.types.end(), [&](const Type& t) { return same(t, made); });
    const auto found = known - _tables.types.begin();
    if (known == _tables.types.end()) _tables.types.push_back(made);
    if (_tables.types.size() > kMostEntries) place.refuse("too many types");
    return static_cast<TypeIndex>(found);
  }

  Type type(const Place& place, const Shape& shape) {
    Type result{.kind = shape.kind,
                .extensible = shape.extensible,
                .unbounded = shape.unbounded,
                .low = shape.low,
                .high = shape.high};
    if (!shape.content.empty()) result.content = index(place, shape.content.front());
    if (!shape.numbers.empty()) {
      result.first = numbers(shape.numbers);
      result.count = static_cast<std::uint16_t>(shape.numbers.size());
    }
    if (shape.kind == Kind::sequence || shape.kind == Kind::choice) members(shape, result);
    return result;
  }

  std::uint16_t numbers(const std::vector<std::int64_t>& wanted) {
    auto& all = _tables.numbers;
    auto found = std::search(all.begin(), all.end(), wanted.begin(), wanted.end());
    const auto place = found - all.begin();
    if (found == all.end()) all.insert(all.end(), wanted.begin(), wanted.end());
    return static_cast<std::uint16_t>(place);
  }

  void members(const Shape& shape, Type& into) {
    const std::size_t first = _tables.fields.size();
    const std::size_t count = shape.root.size() + shape.additions.size();
    _tables.fields.resize(first + count);
    _tables.fieldNames.resize(first + count);
    into.first = static_cast<std::uint16_t>(first);
    into.count = static_cast<std::uint16_t>(shape.root.size());
    into.additions = static_cast<std::uint16_t>(shape.additions.size());
    std::set<std::string> names;
    for (std::size_t i = 0; i < count; ++i) {
      const std::size_t added = i - shape.root.size();
      const Member& member = i < shape.root.size() ? shape.root[i] : shape.additions[added];
      if (first + count > kMostEntries) member.place.refuse("too many fields");
      if (member.name.empty()) continue;
      if (member.name != "group" && !names.insert(member.name).second) {
        member.place.refuse("a second " + member.name);
      }
      const TypeIndex typeIndex = index(member.place, member.shape);
      _tables.fieldNames[first + i] = member.name;
      _tables.fields[first + i] = {typeIndex, mark(member, first + i), member.optional};
    }
  }

  Mark mark(const Member& member, std::size_t field) {
    constexpr auto kFirst = static_cast<std::size_t>(Mark::first);
    if (_wanted == Wanted::every) return static_cast<Mark>(kFirst + field);
    if (!member.wanted) return Mark::none;
    const auto [entry, isNew] = _marks.emplace(identifier(member.name), member.name);
    if (entry->second != member.name) {
      member.place.refuse(member.name + " and " + entry->second + " are the same name in C++");
    }
    if (isNew) _tables.markNames.push_back(member.name);
    const auto& names = _tables.markNames;
    const auto found = std::find(names.begin(), names.end(), member.name) - names.begin();
    return static_cast<Mark>(kFirst + static_cast<std::size_t>(found));
  }

  // How deep the walker goes into a type, with itself.
  unsigned depth(const Place& place, TypeIndex index) {
    const auto [entry, isNew] = _depths.emplace(at(index), 0);
    if (!isNew && entry->second == 0) place.refuse("a type lies in itself");
    if (!isNew) return entry->second;
    const Type type = _tables.types[at(index)];
    unsigned inside = 0;
    if (type.content != TypeIndex::none) inside = depth(place, type.content);
    if (type.kind == Kind::sequence || type.kind == Kind::choice) {
      for (std::size_t i = 0; i < std::size_t{type.count} + type.additions; ++i) {
        const TypeIndex field = _tables.fields[type.first + i].type;
        if (field != TypeIndex::none) inside = std::max(inside, depth(place, field));
      }
    }
    if (inside + 1 > kDeepest) place.refuse("types lie too deep in one another");
    return _depths[at(index)] = inside + 1;
  }

  const std::vector<Definition>& _definitions;
  Wanted _wanted;
  Tables _tables;
  std::map<std::string, TypeIndex> _named;
  std::set<std::string> _used;
  std::map<std::string, std::string> _marks;
  std::map<std::size_t, unsigned> _depths;
};

}  // namespace

TypeIndex Tables::message(const std::string& name) const {
  const auto found = std::find_if(messages.begin(), messages.end(),
                                  [&](const auto& message) { return message.first == name; });
  if (found == messages.end()) throw NotationError("no message has the name " + name);
  return found->second;
}

std::string identifier(const std::string& name) {
  std::string result;
  bool upper = false;
  for (const char c : name) {
    if (c == '-') {
      upper = true;
      continue;
    }
    result += upper && c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c;
    upper = false;
  }
  return result;
}

Tables tablesFrom(const std::vector<Definition>& definitions, Wanted wanted) {
  return Maker(definitions, wanted).make();
}

}  // namespace qel::rrc::generator
